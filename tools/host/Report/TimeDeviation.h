/// @file
#pragma once

#include <cstdint>
#include <vector>

#include "Report/DyadicWindows.h"
#include "Report/PhaseGrid.h"
#include "Report/TauValue.h"

namespace vantelhost {

/// The time deviation for 1, 2, 4, ... intervals, in bounded memory: of the means of the time error
/// in three successive times tau. Up to 1024 intervals they begin at each slot, for longer times at
/// 1024 slots in each. A mean is that of the samples that are there; where more than half of one's
/// are missing, the three are left out.
class TimeDeviation {
public:
    TimeDeviation();

    /// Slots ascend.
    void add(const PhaseSample& sample);

    /// In nanoseconds.
    /// @param interval of the grid, seconds
    std::vector<TauValue> values(double interval) const;

private:
    struct Sum {
        double phases = 0; ///< nanoseconds
        double count = 0;

        void add(const Sum& other) {
            phases += other.phases;
            count += other.count;
        }
        double mean() const { return phases / count; }
    };

    using Windows = DyadicWindows<Sum>;

    struct Octave {
        std::int64_t steps = 0;
        double squares = 0; ///< of second differences of means, in nanoseconds
        std::uint64_t terms = 0;

        void take(const Windows::Window& window);
    };

    void addPlace(const Sum& place);

    Windows windows_;
    std::vector<Octave> octaves_; ///< of 1, 2, 4, ... steps
    std::int64_t nextSlot_ = 0;
};

} // namespace vantelhost
