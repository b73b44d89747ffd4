/// @file
/// Numbers as the user types them. The whole text must be the number.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace vantelhost {

/// A signed decimal integer of 64 bits.
std::optional<std::int64_t> parseInteger(std::string_view text);

/// A duration in seconds, from 0 to a thousand million.
std::optional<double> parseSeconds(std::string_view text);

} // namespace vantelhost
