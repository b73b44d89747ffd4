/// @file
#pragma once

#include <array>

namespace vantelhost {

/// What a drawing is drawn on. A page holds each drawing on all of them, and shows the one that is
/// readable in its width.
struct Canvas {
    const char* name;  ///< the drawing's class in the page
    double width;      ///< pixels
    double leftMargin; ///< a part of the width
    double texts;      ///< so many fit side by side
};

constexpr std::array<Canvas, 2> canvases{{{"wide", 960, 0.09, 12}, {"narrow", 350, 0.23, 4.5}}};

} // namespace vantelhost
