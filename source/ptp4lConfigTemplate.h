/// @file
#pragma once

namespace zekelVantel {

/// ptp4l's configuration file (see ptp4l(8)) with a placeholder, "$" and the key, for each of the
/// fifteen parameters that come from the protocol configuration.
extern const char ptp4lConfigTemplate[];

} // namespace zekelVantel
