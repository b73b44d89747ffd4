/// @file
#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace vantelhost {

/// "run": runs the plug-in and shows what it reports.
std::function<int()> prepareRun(CLI::App& command);

} // namespace vantelhost
