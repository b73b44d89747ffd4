/// @file
/// Drawings of numbers, as HTML.
#pragma once

#include <string>
#include <vector>

#include "Report/AllanDeviation.h"
#include "Report/Decimation.h"
#include "Report/Drawing.h"
#include "Report/Statistics.h"

namespace vantelhost {

/// Values over time as a line that is broken in gaps.
/// @param points   seconds and nanoseconds
/// @param duration of the axis, seconds
/// @param gap      a longer time without a point is one, seconds
std::string seriesFigure(const Caption& caption, const std::vector<Point>& points, double duration,
                         double gap);

/// @param histogram of nanoseconds
std::string histogramFigure(const Caption& caption, const Histogram& histogram);

/// @param deviations not empty; those of 0 are left out.
std::string deviationFigure(const Caption& caption, const std::vector<Deviation>& deviations);

} // namespace vantelhost
