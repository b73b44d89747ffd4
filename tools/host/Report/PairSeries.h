/// @file
#pragma once

#include <cstdint>
#include <optional>

#include "Report/AllanDeviation.h"
#include "Report/PhaseGrid.h"
#include "Report/Series.h"
#include "Report/TauValue.h"
#include "Report/TimeError.h"

namespace vantelhost {

/// A time pair.
struct Pair {
    double seconds = 0;        ///< on the axis of the recording
    std::uint64_t ingress = 0; ///< of the Sync: nanoseconds modulo 2^64, without the epoch offset
    std::int64_t offset = 0;   ///< local minus reference, nanoseconds
    std::int64_t delay = 0;    ///< from the ingress to the call in the host's clock, nanoseconds
};

/// What is kept of time pairs, in bounded memory. All in nanoseconds.
class PairSeries {
public:
    PairSeries() = default;
    PairSeries(const PairSeries&) = delete;
    PairSeries& operator=(const PairSeries&) = delete;

    void add(const Pair& pair);

    /// The next pair comes after nobody knows how many.
    void interrupt();

    /// There are no more.
    void finish() { grid_.flush(); }

    bool empty() const { return !last_; }

    const Series& offsets() const { return offsets_; }
    const Series& delays() const { return delays_; }

    /// From a pair's ingress to that of the next one, which they are at.
    const Series& intervals() const { return intervals_; }

    const PhaseGrid& grid() const { return grid_; }
    const TimeError& timeError() const { return timeError_; }
    std::vector<TauValue> deviations() const { return allan_.deviations(grid_.interval()); }

    /// How many pairs a second there are from the first to the last one; 0 of one moment.
    double rate() const;

private:
    Series offsets_;
    Series delays_;
    Series intervals_;
    AllanDeviation allan_;
    TimeError timeError_;
    PhaseGrid grid_{[this](const PhaseSample& sample) {
        allan_.add(sample);
        timeError_.add(sample, grid_.median());
    }};
    double firstSeconds_ = 0;
    std::optional<Pair> last_;
    bool isInterrupted_ = true;
};

} // namespace vantelhost
