/// @file
/// How the files of a record are called: FILE, and behind it FILE.1, the newest old one, FILE.2 ...
#pragma once

#include <string>
#include <utility>

namespace vantelhost {

/// Number 0 is the file itself.
std::string rotatedName(const std::string& file, unsigned number);

/// The file and the number of a name. A number has at most three digits, and no zero in front.
std::pair<std::string, unsigned> rotatedName(const std::string& name);

/// What a number may be.
constexpr unsigned mostRotated = 999;

} // namespace vantelhost
