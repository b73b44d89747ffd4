/// @file
#pragma once

#include <string>

#include "Json.h"
#include "Report/Limits.h"
#include "Report/Recording.h"

namespace vantelhost {

/// The figures of a recording as a JSON object, which tools/host/README.md describes.
/// @param name   of the recording
/// @param limits null: none
Json reportJson(const Recording& recording, const std::string& name, const Limits* limits);

} // namespace vantelhost
