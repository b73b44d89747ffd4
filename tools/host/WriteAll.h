/// @file
#pragma once

#include <string_view>

namespace vantelhost {

/// Writes the whole text to a descriptor, at once.
/// @return false when that failed; errno says why.
bool writeAll(int descriptor, std::string_view text);

} // namespace vantelhost
