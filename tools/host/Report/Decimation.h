/// @file
#pragma once

#include <cstddef>
#include <vector>

namespace vantelhost {

struct Point {
    double x;
    double y;
};

/// Less points that look the same: of each bin along x the lowest and the highest, in their order.
/// @param points x never descends
/// @return the points themselves if they are no more than that would leave.
std::vector<Point> decimate(const std::vector<Point>& points, std::size_t bins);

} // namespace vantelhost
