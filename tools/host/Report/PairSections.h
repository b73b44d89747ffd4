/// @file
#pragma once

#include <string>

#include "Report/Recording.h"

namespace vantelhost {

/// The sections about time pairs, as HTML: offset, its distribution and stability, intervals, poll
/// delay.
/// @param recording with pairs
std::string pairSections(const Recording& recording);

} // namespace vantelhost
