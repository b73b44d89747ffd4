/// @file
#pragma once

#include <string_view>

namespace zeerr {

/// The blanks of JSON, RFC 8259 clause 2.
inline bool isJsonBlank(char character) {
    return character == ' ' || character == '\t' || character == '\n' || character == '\r';
}

/// Scans an object or array of JSON that the text begins with, and allows anything behind it.
/// Allocates nothing and shares nothing, so that an error can be described when memory is short, on
/// any thread.
/// @return the bracket or brace that closes it, or null when the text begins otherwise, does not
/// scan,
///         or nests deeper than 1000.
const char* closingBracket(std::string_view text);

} // namespace zeerr
