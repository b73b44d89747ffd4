/// @file
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace vantelhost {

/// A round time of day, or a date, on an axis.
struct WallTick {
    double seconds; ///< since the beginning of the axis
    std::string label;
};

/// The smallest round number of seconds that goes into the duration no more often than that.
/// @param duration seconds
/// @param most     at least 1
std::int64_t roundStep(double duration, double most);

/// The ticks of an axis in UTC, at multiples of a step.
/// @param begin    of the axis: nanoseconds since 1970
/// @param duration of the axis, seconds
/// @param step     seconds, of roundStep
std::vector<WallTick> wallTicks(std::uint64_t begin, double duration, std::int64_t step);

} // namespace vantelhost
