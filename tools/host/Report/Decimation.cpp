#include "Report/Decimation.h"

#include <algorithm>

namespace vantelhost {

std::vector<Point> decimate(const std::vector<Point>& points, std::size_t bins) {
    if (points.size() <= 2 * bins) {
        return points;
    }
    const double begin = points.front().x;
    const double width = (points.back().x - begin) / static_cast<double>(bins);
    const auto isLower = [](const Point& a, const Point& b) { return a.y < b.y; };
    std::vector<Point> few;
    auto first = points.begin();
    for (std::size_t bin = 1; bin <= bins; ++bin) {
        const double end = begin + width * static_cast<double>(bin);
        const auto last = bin == bins
                              ? points.end()
                              : std::find_if(first, points.end(),
                                             [end](const Point& point) { return point.x >= end; });
        if (first == last) {
            continue;
        }
        auto [low, high] = std::minmax_element(first, last, isLower);
        few.push_back(*std::min(low, high));
        if (low != high) {
            few.push_back(*std::max(low, high));
        }
        first = last;
    }
    return few;
}

} // namespace vantelhost
