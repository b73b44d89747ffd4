/// @file
#pragma once

#include <string_view>

namespace vantelhost {

/// Writes the whole text to a descriptor, at once.
/// @return false when that failed; errno says why.
bool writeAll(int descriptor, std::string_view text);

/// Writes the whole text to the standard output, at once.
/// @throws std::runtime_error when that failed, which says why
void writeOutput(std::string_view text);

} // namespace vantelhost
