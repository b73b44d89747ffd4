/// @file
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "Report/Canvas.h"
#include "Report/TimeLine.h"
#include "Report/Units.h"

namespace vantelhost {

/// The axis that all drawings over time have: below the time since the beginning, above the
/// time of day. Outages are shaded.
class TimeAxis {
public:
    explicit TimeAxis(const Recording& recording);

    /// What gnuplot is told before it draws over this axis.
    std::string commands(const Canvas& canvas) const;

    /// Where seconds are, as gnuplot counts.
    double at(double seconds) const { return seconds * 1e9 / unit_.size; }

    /// Seconds as wide as a pixel.
    double pixel(const Canvas& canvas) const { return duration_ / canvas.width; }

private:
    std::string wallClock(std::int64_t step) const;
    std::string shades(const Canvas& canvas) const;

    const char* origin_;
    std::uint64_t begin_; ///< nanoseconds since 1970
    double duration_;     ///< seconds
    Unit unit_;
    std::vector<Span> outages_;
};

} // namespace vantelhost
