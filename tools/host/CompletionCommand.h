/// @file
#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace vantelhost {

/// "completion": prints the program's completion for bash.
std::function<int()> prepareCompletion(CLI::App& command);

} // namespace vantelhost
