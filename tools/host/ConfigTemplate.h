/// @file
#pragma once

#include <string>

#include "Schema.h"

namespace CLI {
class App;
}

namespace vantelhost {

/// A configuration file that changes nothing: all options that a file may set, commented out, and
/// the plug-in's parameters with their defaults, each below what it means.
/// @param run the command "run"
std::string configTemplate(const CLI::App& run, const Schema& schema);

} // namespace vantelhost
