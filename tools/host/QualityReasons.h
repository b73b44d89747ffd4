/// @file
/// Reasons of a quality that this host looks at, octet for octet as the plug-in tells them.
#pragma once

namespace vantelhost {

/// A grandmaster came (usable) or is gone.
inline constexpr char roleHasChanged[] = "PTP role has changed.";

inline constexpr char pollHasFailed[] =
    "Unable to communicate with PTP sub process while attempting to retrieve time data";

inline constexpr char daemonHasDied[] = "PTP sub process has died unexpectedly";

} // namespace vantelhost
