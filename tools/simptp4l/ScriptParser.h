/// @file
/// Reads scripts.
#pragma once

#include "Script.h"

#include <istream>
#include <string>
#include <vector>

namespace simptp4l {

struct LineError {
    unsigned line; ///< counted from 1
    std::string text;
};

/// Reads every line, also after an error.
/// @param errors receives one entry for each line that cannot be read; such a line has no effect
Script parseScript(std::istream& input, std::vector<LineError>& errors);

} // namespace simptp4l
