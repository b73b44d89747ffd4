/// @file
#pragma once

#include <array>
#include <cstddef>
#include <vector>

namespace vantelhost {

struct Point {
    double x;
    double y;
};

/// What a stretch tells of its values, in thousandths: the lowest, parts of all, the highest.
constexpr std::array<unsigned, 7> distributionMarks{0, 10, 250, 500, 750, 990, 1000};

/// How the points of a stretch along x are distributed along y.
struct Stretch {
    double begin;
    double end;
    std::array<double, distributionMarks.size()> values; ///< one for each mark; they ascend
};

/// Cuts points along x into stretches of equal length. A stretch without a point is left out.
/// @param points x never descends; not empty
std::vector<Stretch> distribution(const std::vector<Point>& points, std::size_t stretches);

} // namespace vantelhost
