/// @file
#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace vantelhost {

/// "report": makes a page of a recording.
std::function<int()> prepareReport(CLI::App& command);

} // namespace vantelhost
