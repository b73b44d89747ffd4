/// @file
#pragma once

#include <string>

#include "Report/Limits.h"
#include "Report/Recording.h"

namespace vantelhost {

/// The sections about time pairs, as HTML: offset, its distribution and stability, intervals, poll
/// delay.
/// @param recording with pairs
/// @param limits    null: none
std::string pairSections(const Recording& recording, const Limits* limits);

} // namespace vantelhost
