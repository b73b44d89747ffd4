/// @file
/// Drawings of numbers, as HTML.
#pragma once

#include <string>
#include <vector>

#include "Report/AllanDeviation.h"
#include "Report/Drawing.h"
#include "Report/Statistics.h"

namespace vantelhost {

/// @param histogram of nanoseconds
std::string histogramFigure(const Caption& caption, const Histogram& histogram);

/// @param deviations not empty; those of 0 are left out.
std::string deviationFigure(const Caption& caption, const std::vector<Deviation>& deviations);

} // namespace vantelhost
