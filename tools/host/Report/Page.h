/// @file
#pragma once

#include <string>

#include "Report/Limits.h"
#include "Report/Recording.h"

namespace vantelhost {

/// A page about a recording: HTML with style and drawings inside, without scripts.
/// @param name   of the recording
/// @param limits that its time error is judged by; null: none
/// Throws std::runtime_error when the drawings cannot be made.
std::string reportPage(const Recording& recording, const std::string& name, const Limits* limits);

} // namespace vantelhost
