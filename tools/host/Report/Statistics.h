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
template <typename Number>
Number percentile(const std::vector<Number>& sorted, unsigned perMille) {
    // Of some millions the product is beyond 32 bits.
    const auto rank =
        static_cast<std::size_t>((std::uint64_t{perMille} * sorted.size() + 999) / 1000);
    return sorted[rank == 0 ? 0 : rank - 1];
}

struct Extent {
    double low;
    double high;
};

/// Where all but a few of the values are: a thousandth at each end, or of fewer than 3000 values
/// up to three, but no more than a tenth, does not count. It is then made wider by a quarter at
/// each end, at least by 10, for the values that are not far away, but reaches no further than the
/// values.
/// @param sorted ascending, not empty
Extent bulk(const std::vector<std::int64_t>& sorted);

/// What to take away from values of this extent, so that few digits tell them apart: their lowest,
/// or 0 if it needs not be. So a difference of nanoseconds is seen behind an epoch offset.
double baseOf(const Extent& extent);

/// The next of 1, 2, 5, 10, 20 ... that is not smaller.
double roundWidth(double width);

/// How many values fall into each of some bins of equal width.
struct Histogram {
    double low = 0;   ///< where the first bin begins
    double width = 1; ///< 1, 2 or 5 times a power of ten
    std::vector<std::size_t> counts;
    std::size_t below = 0; ///< values left of all bins
    std::size_t above = 0; ///< values right of all bins
};

/// The bins are where the bulk of the values is.
/// @param sorted ascending, not empty
/// @param bins   about how many at most
Histogram histogram(const std::vector<std::int64_t>& sorted, std::size_t bins);

} // namespace vantelhost
