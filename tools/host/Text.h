/// @file
#pragma once

#include <string>
#include <string_view>

#include "Json.h"

namespace vantelhost {

/// The text on one line: control characters become \xNN.
std::string onOneLine(std::string_view text);

/// What the system calls an error of this number of errno.
std::string errorText(int number);

/// The value as JSON text in ASCII; what is not UTF-8 is replaced.
std::string toAscii(const Json& value);

/// The value for a message: JSON text, cut when long.
std::string shown(const Json& value);

/// A member as people read it: strings bare, a missing member as "?".
std::string shownMember(const Json& object, const char* key);

/// Whether JSON text can carry these octets.
bool isUtf8(const std::string& text);

} // namespace vantelhost
