/// @file
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "ViewState.h"

namespace vantelhost {

struct ScreenSize {
    std::size_t rows;
    std::size_t columns;
};

/// The live view, line by line, in printable ASCII. Quality and hints are wrapped, other lines cut
/// to the width, with "..." in place of what is missing; of ports, as many are left out as the
/// height asks for, then of all from the end.
std::vector<std::string> viewLines(const ViewState& state, double now, ScreenSize size);

/// As hours:minutes:seconds.
std::string shownHours(double seconds);

/// A clock of the metadata, whose members are named.
std::string shownClock(const Json& metadata, const char* identity, const char* clockClass,
                       const char* accuracy);

/// Nanoseconds as people read them, with a unit that leaves at most four digits before the point.
std::string shownOffset(double nanoseconds);

} // namespace vantelhost
