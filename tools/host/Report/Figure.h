/// @file
/// Drawings of numbers, as HTML.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "Report/Drawing.h"
#include "Report/Statistics.h"
#include "Report/TauValue.h"

namespace vantelhost {

/// @param histogram of nanoseconds
std::string histogramFigure(const Caption& caption, const Histogram& histogram);

/// Values over tau.
struct Curve {
    std::vector<TauValue> values; ///< those of 0 are left out
    unsigned colour;
};

/// What values are to stay below, from one tau to another.
struct Mask {
    double from; ///< seconds
    double to;   ///< seconds
    double limit;
};

/// A line for each curve, and a dashed one for the mask; both axes are logarithmic.
/// @param name   of the values, for people; no part of it may come from a stranger
/// @param curves with at least one value above 0
std::string tauFigure(const Caption& caption, const std::string& name,
                      const std::vector<Curve>& curves, const std::optional<Mask>& mask);

} // namespace vantelhost
