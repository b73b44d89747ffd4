#include "Report/Statistics.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

Extent joined(const std::optional<Extent>& extent, double value) {
    return extent ? Extent{std::min(extent->low, value), std::max(extent->high, value)}
                  : Extent{value, value};
}

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

std::int64_t percentile(const ValueCounts& values, unsigned perMille) {
    const std::uint64_t number = (perMille * values.size() + 999) / 1000;
    return values.at(number == 0 ? 0 : number - 1);
}

Extent bulk(const ValueCounts& values) {
    constexpr std::uint64_t few = 3;
    const auto count = values.size();
    const auto out = std::max(count / 1000, std::min(few, count / 10));
    const auto low = static_cast<double>(values.at(out));
    const auto high = static_cast<double>(values.at(count - 1 - out));
    const double margin = std::max((high - low) / 4, 10.0);
    return {std::max(static_cast<double>(values.smallest()), low - margin),
            std::min(static_cast<double>(values.largest()), high + margin)};
}

Outliers outliers(const ValueCounts& values, const Extent& extent) {
    Outliers result;
    for (const auto& [value, count] : values.rows()) {
        const auto number = static_cast<double>(value);
        result.below += number < extent.low ? count : 0;
        result.above += number > extent.high ? count : 0;
    }
    return result;
}

double baseOf(const Extent& extent) {
    constexpr double shownParts = 1e4;
    const double largest = std::max(std::abs(extent.low), std::abs(extent.high));
    return (extent.high - extent.low) * shownParts < largest ? std::floor(extent.low) : 0;
}

Histogram histogram(const ValueCounts& values, std::size_t bins) {
    const auto [low, high] = bulk(values);
    Histogram result;
    result.width = roundWidth((high - low) / static_cast<double>(bins));
    result.low = std::floor(low / result.width) * result.width;
    const auto binOf = [&](double value) {
        return static_cast<std::size_t>((value - result.low) / result.width);
    };
    result.counts.resize(binOf(high) + 1);
    for (const auto& [value, count] : values.rows()) {
        const auto number = static_cast<double>(value);
        if (number < result.low) {
            result.below += count;
        } else if (binOf(number) >= result.counts.size()) {
            result.above += count;
        } else {
            result.counts[binOf(number)] += count;
        }
    }
    return result;
}

} // namespace vantelhost
