/// @file
/// What lines are drawn in: red, green, blue.
#pragma once

namespace vantelhost {

/// The page's style makes it brighter on a dark screen.
constexpr unsigned dataColour = 0x2B6CB0;

constexpr unsigned filteredColour = 0x2A9D4A;
constexpr unsigned maskColour = 0xD9480F;

} // namespace vantelhost
