/// @file
#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace vantelhost {

/// "check": says what would keep the plug-in from working on this machine.
std::function<int()> prepareCheck(CLI::App& command);

} // namespace vantelhost
