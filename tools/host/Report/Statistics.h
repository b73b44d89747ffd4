/// @file
/// Figures of many values, such as offsets in nanoseconds.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "Report/ValueCounts.h"

namespace vantelhost {

/// The smallest of the values that at least so many thousandths of all do not exceed.
/// @param values   not empty
/// @param perMille 0 to 1000; 500 is the median.
std::int64_t percentile(const ValueCounts& values, unsigned perMille);

struct Extent {
    double low;
    double high;
};

/// The extent of its values and another one.
Extent joined(const std::optional<Extent>& extent, double value);

/// Where all but a few of the values are: a thousandth at each end, or of fewer than 3000 values
/// up to three, but no more than a tenth, does not count. It is then made wider by a quarter at
/// each end, at least by 10, for the values that are not far away, but reaches no further than the
/// values.
/// @param values not empty
Extent bulk(const ValueCounts& values);

/// How many values are outside.
struct Outliers {
    std::uint64_t below = 0;
    std::uint64_t above = 0;
};

Outliers outliers(const ValueCounts& values, const Extent& extent);

/// What to take away from values of this extent, so that few digits tell them apart: their lowest,
/// or 0 if it needs not be. So a difference of nanoseconds is seen behind an epoch offset.
double baseOf(const Extent& extent);

/// The next of 1, 2, 5, 10, 20 ... that is not smaller.
double roundWidth(double width);

/// How many values fall into each of some bins of equal width.
struct Histogram {
    double low = 0;   ///< where the first bin begins
    double width = 1; ///< 1, 2 or 5 times a power of ten
    std::vector<std::uint64_t> counts;
    std::uint64_t below = 0; ///< values left of all bins
    std::uint64_t above = 0; ///< values right of all bins
};

/// The bins are where the bulk of the values is.
/// @param values not empty
/// @param bins   about how many at most
Histogram histogram(const ValueCounts& values, std::size_t bins);

} // namespace vantelhost
