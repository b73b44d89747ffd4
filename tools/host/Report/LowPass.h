/// @file
#pragma once

#include <cstdint>
#include <optional>

#include "Report/PhaseGrid.h"

namespace vantelhost {

/// A low-pass filter of first order on an even grid. It stands still in places without a sample.
class LowPass {
public:
    /// @param cutoff   hertz
    /// @param interval of the grid, seconds; above 0
    LowPass(double cutoff, double interval);

    /// @return nanoseconds; nothing until it has settled, for five of its time constants from a
    /// beginning on
    std::optional<double> next(const PhaseSample& sample);

private:
    double weight_; ///< of the sample, once so many have come that their mean would have less
    double settling_;
    double count_ = 0;
    double level_ = 0;
};

} // namespace vantelhost
