/// @file
#pragma once

#include <string>
#include <vector>

#include "Report/Distribution.h"
#include "Report/Drawing.h"
#include "Report/Statistics.h"
#include "Report/TimeAxis.h"

namespace vantelhost {

/// Values over time.
struct Series {
    std::vector<Point> points; ///< seconds and nanoseconds; not empty
    Extent range{0, 0};        ///< of the axis, nanoseconds; what lies beyond is marked at the edge
    double gap = 0;            ///< a longer time without a point is one, seconds
};

/// Whether so many points are drawn as bands, or else as a line that is broken in gaps.
bool areBands(std::size_t points);

/// Into how many stretches of time bands are cut.
constexpr std::size_t bandStretches = 300;

/// The drawing, as HTML.
std::string seriesFigure(const Caption& caption, const Series& series, const TimeAxis& axis);

} // namespace vantelhost
