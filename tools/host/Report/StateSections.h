/// @file
#pragma once

#include <string>

#include "Report/Recording.h"

namespace vantelhost {

/// The section about what is missing, as HTML; empty when nothing is.
std::string gapSection(const Recording& recording);

/// The sections about health, quality, port states and errors, as HTML.
std::string stateSections(const Recording& recording);

} // namespace vantelhost
