#include "CommandLine.h"

#include <utility>

#include <CLI/CLI.hpp>

#include "UsageError.h"

namespace vantelhost {

int execute(const std::vector<Subcommand>& subcommands, int argc, const char* const* argv) {
    CLI::App app("A host for the boundary clock plug-in.", "vantel-host");
    app.require_subcommand(1);
    std::vector<std::pair<CLI::App*, std::function<int()>>> actions;
    for (const auto& subcommand : subcommands) {
        auto* command = app.add_subcommand(subcommand.name, subcommand.description);
        actions.emplace_back(command, subcommand.prepare(*command));
    }
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? exitClean : exitUsage;
    }
    for (const auto& [command, action] : actions) {
        if (command->parsed()) {
            return action();
        }
    }
    return exitUsage;
}

} // namespace vantelhost
