#include "Report/Distribution.h"

#include <algorithm>
#include <cstdint>

#include "Report/Statistics.h"

namespace vantelhost {

namespace {

Stretch stretchOf(double begin, double end, std::vector<double>& values) {
    Stretch stretch{begin, end, {}};
    std::sort(values.begin(), values.end());
    for (std::size_t mark = 0; mark < distributionMarks.size(); ++mark) {
        stretch.values[mark] = percentile(values, distributionMarks[mark]);
    }
    return stretch;
}

} // namespace

std::vector<Stretch> distribution(const std::vector<Point>& points, std::size_t stretches) {
    const double begin = points.front().x;
    const double width = (points.back().x - begin) / static_cast<double>(stretches);
    const auto edge = [&](std::size_t number) {
        return begin + width * static_cast<double>(number);
    };
    std::vector<Stretch> result;
    std::vector<double> values;
    auto point = points.begin();
    for (std::size_t number = 1; number <= stretches; ++number) {
        values.clear();
        const double end = edge(number);
        for (; point != points.end() && (point->x < end || number == stretches); ++point) {
            values.push_back(point->y);
        }
        if (!values.empty()) {
            result.push_back(stretchOf(edge(number - 1), end, values));
        }
    }
    return result;
}

} // namespace vantelhost
