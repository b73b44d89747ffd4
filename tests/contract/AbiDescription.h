/// @file
#pragma once

#include <string>

/// The binary interface of a library as a text to read and to compare. It does not depend on the
/// compiler, on sanitizers or on the width of pointers.
/// @param objects the paths of the library's objects, one in a line; virtual functions are read
///        from them, since the library itself does not name them.
/// @throws std::runtime_error when a file is not of the kind that this program is.
std::string describeAbi(const std::string& library, const std::string& objects);
