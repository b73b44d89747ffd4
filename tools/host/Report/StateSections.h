/// @file
#pragma once

#include <string>

#include "Report/Recording.h"

namespace vantelhost {

/// The sections about quality, port states and errors, as HTML.
std::string stateSections(const Recording& recording);

} // namespace vantelhost
