/// @file
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "Report/Distribution.h"
#include "Report/ValueCounts.h"
#include "Tally.h"

namespace vantelhost {

struct Point {
    double x;
    double y;
};

/// Values over time, in bounded memory.
class Series {
public:
    /// @param seconds never descends
    void add(double seconds, std::int64_t value);

    const ValueCounts& values() const { return values_; }
    const OffsetStatistics& statistics() const { return statistics_; }
    const Distribution& distribution() const { return distribution_; }

    /// Whether there are so few that each is kept.
    bool isWhole() const { return statistics_.count <= few; }

    /// Of a whole series: all, in seconds.
    const std::vector<Point>& points() const { return points_; }

private:
    static constexpr std::size_t few = 3000;

    ValueCounts values_;
    OffsetStatistics statistics_;
    Distribution distribution_;
    std::vector<Point> points_;
};

} // namespace vantelhost
