/// @file
#pragma once

#include <cstdint>

namespace vantelhost {

/// The local time of a pair in CLOCK_REALTIME, in nanoseconds.
struct Carried {
    std::uint64_t realtime = 0;
    std::uint64_t uncertainty = 0; ///< so far off, either way, it may be
    bool isOfOtherClock = false;   ///< than CLOCK_REALTIME: told with the pair
};

} // namespace vantelhost
