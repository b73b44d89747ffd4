/// @file
#pragma once

#include <cstdint>

namespace zekelVantel {

/// The first sleep, and the one after a pass that ended in an error, in microseconds.
inline constexpr std::uint32_t longestSleep = 125000;

/// How long to sleep before the next poll, so that it comes 128 ms after the last Sync, soon after
/// ptp4l has measured the one that follows.
/// @param now         the host's time in nanoseconds.
/// @param ingressTime of the last Sync, in nanoseconds on the same time base.
/// @return microseconds, from 16000 to 125000.
std::uint32_t sleepLength(std::uint64_t now, std::uint64_t ingressTime);

} // namespace zekelVantel
