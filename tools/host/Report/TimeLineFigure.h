/// @file
/// Drawings of time lines, as HTML.
#pragma once

#include <string>

#include "Report/Drawing.h"
#include "Report/TimeAxis.h"
#include "Report/TimeLine.h"

namespace vantelhost {

std::string timeLineFigure(const Caption& caption, const TimeLine& timeLine, const TimeAxis& axis);

/// What the colours of a time line mean, as HTML.
std::string timeLineLegend(const TimeLine& timeLine);

} // namespace vantelhost
