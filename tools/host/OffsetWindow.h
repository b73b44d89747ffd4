/// @file
#pragma once

#include <cstdint>
#include <deque>
#include <utility>

#include "Tally.h"

namespace vantelhost {

/// The offsets of the last seconds.
class OffsetWindow {
public:
    explicit OffsetWindow(double length) : length_(length) {}

    double length() const { return length_; }

    /// @param seconds when; never before the last one.
    /// @param offset  nanoseconds
    void add(double seconds, std::int64_t offset);

    /// Of the offsets that are at most as old as the window is long.
    OffsetStatistics statistics(double now) const;

    /// How many offsets came in each second since the oldest one in the window; 0 with less than
    /// two.
    double rate(double now) const;

private:
    std::deque<std::pair<double, std::int64_t>>::const_iterator oldest(double now) const;

    double length_;
    std::deque<std::pair<double, std::int64_t>> offsets_;
};

} // namespace vantelhost
