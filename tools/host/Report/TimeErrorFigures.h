/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "Report/PairSeries.h"
#include "Report/Statistics.h"
#include "Report/TauValue.h"
#include "Report/TimeError.h"

namespace vantelhost {

/// The figures of a time error, which is the offset of the pairs: local minus reference. In
/// nanoseconds, but for what says otherwise.
struct TimeErrorFigures {
    double interval = 0;      ///< of the grid, seconds; 0: there is none, and nothing that needs it
    std::int64_t missing = 0; ///< places of the grid without a pair
    double seconds = 0;       ///< what the pairs stand for: one interval each
    Extent extent{0, 0};
    double mean = 0;
    double rms = 0;
    std::uint64_t averages = 0;          ///< so many means of 1000 s there are
    std::optional<Extent> constant;      ///< the lowest and the highest of those
    std::optional<double> lowPassRange;  ///< dTE below 0.1 Hz, from peak to peak
    std::optional<double> highPassRange; ///< dTE above it
    Wander whole;                        ///< of the time error
    Wander low;                          ///< of dTE below 0.1 Hz
    std::vector<TauValue> deviations;    ///< Allan's, dimensionless

    /// max|TE|
    double largest() const;

    /// cTE: the mean of 1000 s that is farthest from 0; of less time the mean of all.
    double constantError() const;
};

/// @param pairs measured ones; not empty
TimeErrorFigures figuresOf(const PairSeries& pairs);

} // namespace vantelhost
