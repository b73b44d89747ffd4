/// @file
#pragma once

#include <string>

/// What a command of the shell writes to its standard output.
std::string outputOf(const std::string& command);
