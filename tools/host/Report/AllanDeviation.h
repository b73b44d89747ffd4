/// @file
/// The stability of a clock from its offsets.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "Report/PhaseGrid.h"
#include "Report/TauValue.h"

namespace vantelhost {

/// The overlapping Allan deviation for 1, 2, 4, ... intervals, in bounded memory: up to 1024
/// intervals a second difference begins at each slot, for longer times at 1024 slots in each.
/// Second differences that need a missing sample are left out.
class AllanDeviation {
public:
    AllanDeviation();

    /// Slots ascend.
    void add(const PhaseSample& sample);

    /// Dimensionless, up to a quarter of all slots. One without any second difference is not there.
    /// @param interval of the grid, seconds
    std::vector<TauValue> deviations(double interval) const;

private:
    /// The last samples of slots whose number ends in so many zeros, in binary.
    struct Ring {
        unsigned zeros;
        std::vector<PhaseSample> samples;

        bool takes(std::int64_t slot) const { return slot >> zeros << zeros == slot; }
        PhaseSample& at(std::int64_t slot);
        void clear();
    };

    struct Octave {
        std::int64_t steps = 0;
        double squares = 0; ///< of second differences, in nanoseconds
        std::uint64_t terms = 0;

        void add(Ring& ring, const PhaseSample& last);
    };

    std::vector<Ring> rings_;     ///< of 0, 1, 2, ... zeros
    std::vector<Octave> octaves_; ///< of 1, 2, 4, ... steps
    std::int64_t slots_ = 0;
};

} // namespace vantelhost
