/// @file
/// What all drawings have in common: SVG elements that gnuplot makes.
#pragma once

#include <cstddef>
#include <string>

#include "Report/Units.h"

namespace vantelhost {

/// What a drawing is called.
struct Caption {
    std::string name;  ///< a word, unlike those of the page's other drawings
    std::string title; ///< for those who do not see it
};

constexpr double drawingWidth = 960; ///< pixels

/// @param height   pixels
/// @param commands what gnuplot draws; no part of them may come from a stranger.
/// @return HTML
/// Throws std::runtime_error.
std::string draw(const Caption& caption, std::size_t height, const std::string& commands);

/// The commands for the axis that all drawings over time have.
/// @param duration seconds
std::string timeAxis(double duration, const Unit& unit);

} // namespace vantelhost
