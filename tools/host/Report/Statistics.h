/// @file
/// Figures of many values, such as offsets in nanoseconds.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace vantelhost {

/// The smallest of the values that at least so many thousandths of all do not exceed.
/// @param sorted   ascending, not empty
/// @param perMille 0 to 1000; 500 is the median.
std::int64_t percentile(const std::vector<std::int64_t>& sorted, unsigned perMille);

/// How many values fall into each of some bins of equal width.
struct Histogram {
    double low = 0;   ///< where the first bin begins
    double width = 1; ///< 1, 2 or 5 times a power of ten
    std::vector<std::size_t> counts;
    std::size_t below = 0; ///< values left of all bins
    std::size_t above = 0; ///< values right of all bins
};

/// Few values far away do not stretch it: the bins reach half the distance of the 1st and the 99th
/// percentile beyond them, but no further than the values.
/// @param sorted ascending, not empty
/// @param bins   about how many at most
Histogram histogram(const std::vector<std::int64_t>& sorted, std::size_t bins);

} // namespace vantelhost
