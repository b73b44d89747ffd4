/// @file
/// The stability of a clock from its offsets.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace vantelhost {

/// An offset at its place on an even grid of time.
struct PhaseSample {
    std::int64_t slot;
    double phase; ///< nanoseconds
};

struct PhaseSeries {
    double interval = 0;      ///< of the grid, in seconds; 0 with less than two samples
    std::int64_t missing = 0; ///< slots without a sample, between the first and the last one
    std::vector<PhaseSample> samples; ///< slots ascend
};

/// Puts offsets onto a grid. Its interval is the mean of the distances between neighbours that
/// nothing is missing between: those that round to one median distance. A longer distance leaves
/// as many slots empty as it rounds to.
/// @param times   nanoseconds, one for each offset
/// @param offsets nanoseconds
PhaseSeries onGrid(const std::vector<std::uint64_t>& times,
                   const std::vector<std::int64_t>& offsets);

struct Deviation {
    double tau;        ///< seconds
    double value;      ///< dimensionless
    std::size_t terms; ///< how many second differences it is made of; at least 1
};

/// The overlapping Allan deviation for 1, 2, 4, ... intervals, up to a quarter of the series'
/// length. Second differences that need a missing sample are left out; a deviation without any is
/// not there.
std::vector<Deviation> allanDeviations(const PhaseSeries& series);

} // namespace vantelhost
