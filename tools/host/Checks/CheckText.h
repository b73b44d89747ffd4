/// @file
/// What the checks said, for people and for programs.
#pragma once

#include <string>

#include "Checks/Finding.h"
#include "Json.h"

namespace vantelhost {

/// Whether none failed. Doubts and what could not be told do not count.
bool allHold(const CheckResults& results);

/// A line for each.
std::string checkLines(const CheckResults& results);

/// {"passed": boolean, "checks": [{"check", "result", "found", "mend"}]}, all strings; the result
/// is "ok", "warn", "fail" or "skip".
Json checkJson(const CheckResults& results);

} // namespace vantelhost
