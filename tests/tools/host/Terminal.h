/// @file
#pragma once

#include <string>

#include "support/Child.h"

/// A program on a terminal of its own, of 24 rows and 80 columns. Input is what is typed; errors
/// are part of the output.
class Terminal : public Child {
public:
    /// @param command the program's path and its arguments
    /// @param kind    what TERM says
    explicit Terminal(const Words& command, const std::string& kind = "xterm");

    void resize(unsigned short rows, unsigned short columns) const;
};
