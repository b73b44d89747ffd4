/// @file
#pragma once

#include <string>

#include "Json.h"

namespace vantelhost {

/// The answer of a run, on one screen for people.
/// @param status as StatusPage gives it. Throws Json::exception when it is something else.
std::string statusText(const Json& status);

} // namespace vantelhost
