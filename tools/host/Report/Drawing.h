/// @file
/// What all drawings have in common: SVG elements that gnuplot makes.
#pragma once

#include <cstddef>
#include <functional>
#include <string>

#include "Report/Canvas.h"

namespace vantelhost {

/// What a drawing is called.
struct Caption {
    std::string name;  ///< a word, unlike those of the page's other drawings
    std::string title; ///< for those who do not see it
};

/// @param height   pixels
/// @param commands what gnuplot draws on a canvas; no part of them may come from a stranger.
/// @return HTML: the drawing on every canvas
/// Throws std::runtime_error.
std::string draw(const Caption& caption, std::size_t height,
                 const std::function<std::string(const Canvas&)>& commands);

} // namespace vantelhost
