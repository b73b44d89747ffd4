/// @file
#pragma once

#include <string>

namespace CLI {
class App;
}

namespace vantelhost {

/// The program's completion for bash: commands, options, and of their values files, interfaces and
/// the plug-in's parameters, as the options' type names tell them.
std::string bashCompletion(const CLI::App& program);

} // namespace vantelhost
