#include "Report/Statistics.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

/// The next of 1, 2, 5, 10, 20 ... that is not smaller.
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

} // namespace

std::int64_t percentile(const std::vector<std::int64_t>& sorted, unsigned perMille) {
    const std::size_t rank = (perMille * sorted.size() + 999) / 1000;
    return sorted[rank == 0 ? 0 : rank - 1];
}

Histogram histogram(const std::vector<std::int64_t>& sorted, std::size_t bins) {
    const auto first = static_cast<double>(sorted.front());
    const auto last = static_cast<double>(sorted.back());
    const auto left = static_cast<double>(percentile(sorted, 10));
    const auto right = static_cast<double>(percentile(sorted, 990));
    const double margin = (right - left) / 2;
    const double low = margin > 0 ? std::max(first, left - margin) : first;
    const double high = margin > 0 ? std::min(last, right + margin) : last;

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
