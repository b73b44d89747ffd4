/// @file
#pragma once

#include <string>

namespace vantelhost {

/// Runs gnuplot, which must be in the PATH.
/// @param script what it is to do; no part of it may come from a stranger.
/// @return its standard output.
/// Throws std::runtime_error.
std::string runGnuplot(const std::string& script);

} // namespace vantelhost
