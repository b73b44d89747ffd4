#include "Report/Statistics.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

double roundWidth(double width) {
    double power = 1;
    while (power * 10 <= width) {
        power *= 10;
    }
    for (const double factor : {1, 2, 5}) {
        if (width <= factor * power) {
            return factor * power;
        }
    }
    return 10 * power;
}

Extent bulk(const std::vector<std::int64_t>& sorted) {
    constexpr std::size_t few = 3;
    const auto count = sorted.size();
    const auto first = static_cast<double>(sorted.front());
    const auto last = static_cast<double>(sorted.back());
    const auto out = std::max(count / 1000, std::min(few, count / 10));
    const auto low = static_cast<double>(sorted[out]);
    const auto high = static_cast<double>(sorted[count - 1 - out]);
    const double margin = std::max((high - low) / 4, 10.0);
    return {std::max(first, low - margin), std::min(last, high + margin)};
}

double baseOf(const Extent& extent) {
    constexpr double shownParts = 1e4;
    const double largest = std::max(std::abs(extent.low), std::abs(extent.high));
    return (extent.high - extent.low) * shownParts < largest ? std::floor(extent.low) : 0;
}

Histogram histogram(const std::vector<std::int64_t>& sorted, std::size_t bins) {
    const auto [low, high] = bulk(sorted);
    Histogram result;
    result.width = roundWidth((high - low) / static_cast<double>(bins));
    result.low = std::floor(low / result.width) * result.width;
    const auto binOf = [&](double value) {
        return static_cast<std::size_t>((value - result.low) / result.width);
    };
    result.counts.resize(binOf(high) + 1);
    for (const auto value : sorted) {
        const auto number = static_cast<double>(value);
        if (number < result.low) {
            ++result.below;
        } else if (binOf(number) >= result.counts.size()) {
            ++result.above;
        } else {
            ++result.counts[binOf(number)];
        }
    }
    return result;
}

} // namespace vantelhost
