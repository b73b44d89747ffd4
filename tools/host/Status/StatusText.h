/// @file
#pragma once

#include <string>

#include "Json.h"

namespace vantelhost {

/// The answer of a run, on one screen for people.
/// @param status as StatusPage gives it
std::string statusText(const Json& status);

} // namespace vantelhost
