/// @file
#pragma once

#include <string>

#include "Report/Recording.h"

namespace vantelhost {

/// A page about a recording: HTML with style and drawings inside, without scripts.
/// @param name of the recording
/// Throws std::runtime_error when the drawings cannot be made.
std::string reportPage(const Recording& recording, const std::string& name);

} // namespace vantelhost
