/// @file
/// The subcommand "status": asks a run how it stands.
#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace vantelhost {

/// As Subcommand::prepare.
std::function<int()> prepareStatus(CLI::App& command);

} // namespace vantelhost
