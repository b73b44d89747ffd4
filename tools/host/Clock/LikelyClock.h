/// @file
/// Which clock a local time is of.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace vantelhost {

/// A clock of this machine.
struct KnownClock {
    std::string name;   ///< for people
    std::string option; ///< of --clock; empty when there is none
    std::uint64_t now;  ///< nanoseconds since its epoch
};

/// Whether a time is within 2 s of a clock's, in nanoseconds modulo 2^64.
bool isOfClock(std::uint64_t time, std::uint64_t now);

/// CLOCK_REALTIME, the PTP clocks that can be read, TAI and CLOCK_MONOTONIC, now.
/// @param dev where the devices are
std::vector<KnownClock> knownClocks(const std::string& dev = "/dev");

/// What to say about the local time of a pair that is not of the clock with this name.
std::string otherClockText(std::uint64_t local, const std::string& clock,
                           const std::vector<KnownClock>& known);

} // namespace vantelhost
