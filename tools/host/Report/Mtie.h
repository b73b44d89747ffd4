/// @file
#pragma once

#include <algorithm>
#include <cstdint>
#include <limits>
#include <vector>

#include "Report/DyadicWindows.h"
#include "Report/PhaseGrid.h"
#include "Report/TauValue.h"

namespace vantelhost {

/// The maximum time interval error: by how much the time error changes at most within any window of
/// a time tau, for 1, 2, 4, ... intervals. Up to 2^17 intervals all windows are looked at, of
/// longer ones those that begin at 2^17 places of each time. In places without a sample nothing
/// changes: with some missing, it is the least that it may be.
class Mtie {
public:
    /// @param extra so many intervals besides, up to 2^17; 0: none
    explicit Mtie(std::int64_t extra = 0);

    /// Slots ascend.
    void add(const PhaseSample& sample);

    /// In nanoseconds; tau ascends. Windows reach over no beginning, and not beyond the samples.
    /// @param interval of the grid, seconds
    std::vector<TauValue> values(double interval) const;

private:
    struct Extremes {
        double low = std::numeric_limits<double>::infinity();
        double high = -std::numeric_limits<double>::infinity();

        void add(const Extremes& other) {
            low = std::min(low, other.low);
            high = std::max(high, other.high);
        }
    };

    using Windows = DyadicWindows<Extremes>;

    /// The windows of one tau.
    struct Span {
        std::int64_t steps = 0; ///< intervals: one less than places
        double largest = 0;     ///< nanoseconds
        std::uint64_t windows = 0;

        void take(const Windows::Window& window, std::int64_t places);
    };

    void addPlace(const Extremes& place);

    Windows windows_;
    std::vector<Span> octaves_; ///< of 1, 2, 4, ... steps
    Span extra_;
    unsigned extraOctave_;
    std::int64_t nextSlot_ = 0;
};

} // namespace vantelhost
