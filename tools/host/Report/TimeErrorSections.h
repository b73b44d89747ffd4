/// @file
#pragma once

#include <string>

#include "Report/Limits.h"
#include "Report/PairSeries.h"

namespace vantelhost {

/// The sections about the time error, as HTML: its parts, how they keep the limits, MTIE, TDEV and
/// the Allan deviation.
/// @param pairs  measured ones; not empty
/// @param limits null: none
std::string timeErrorSections(const PairSeries& pairs, const Limits* limits);

} // namespace vantelhost
