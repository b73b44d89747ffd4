/// @file
#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace vantelhost {

/// "schema": prints the plug-in's parameters.
std::function<int()> prepareSchema(CLI::App& command);

} // namespace vantelhost
