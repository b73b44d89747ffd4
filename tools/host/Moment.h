/// @file
#pragma once

#include <chrono>
#include <cstdint>

namespace vantelhost {

/// CLOCK_REALTIME: nanoseconds since 1970.
std::uint64_t realtimeNanoseconds();

/// When something happened, in both clocks.
struct Moment {
    using Clock = std::chrono::steady_clock;

    static Moment now(Clock::time_point begin);

    double seconds;         ///< since the beginning
    std::uint64_t realtime; ///< nanoseconds since 1970
};

/// The beginning in the clock that the moment has: nanoseconds since 1970. Seconds count to the
/// microsecond, as records have them.
std::uint64_t beginOf(const Moment& moment);

} // namespace vantelhost
