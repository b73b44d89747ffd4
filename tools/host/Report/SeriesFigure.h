/// @file
#pragma once

#include <string>

#include "Report/Drawing.h"
#include "Report/Series.h"
#include "Report/Statistics.h"
#include "Report/TimeAxis.h"

namespace vantelhost {

/// How values are drawn over time.
struct SeriesStyle {
    Extent range{0, 0}; ///< of the axis, nanoseconds; what lies beyond is marked at the edge
    double gap = 0;     ///< a longer time without a point breaks a line, seconds
};

/// The drawing, as HTML: of a whole series a line, else bands, one part for each stretch of time.
/// @param series nanoseconds; not empty
std::string seriesFigure(const Caption& caption, const Series& series, const SeriesStyle& style,
                         const TimeAxis& axis);

} // namespace vantelhost
