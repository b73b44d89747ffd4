#include "RunCommand.h"

#include <memory>

#include <CLI/CLI.hpp>

#include "ConfigReload.h"
#include "Run.h"
#include "RunConfig.h"
#include "RunOptions.h"
#include "Signals.h"

namespace vantelhost {

namespace {

/// Reads the settings before the signals are blocked: Ctrl-C still ends a wait for typed ones.
int run(const Words& commandLine) {
    const RunConfig config = readRunConfig(commandLine);
    refuseBadFile(config.errors);
    Signals signals(canReread(config.options) ? Hangup::reread : Hangup::stop);
    const auto reread = [&](const Schema& schema, const Json& settings) {
        return rereadConfig(commandLine, config, schema, settings);
    };
    return Run(config.options, config.json, signals, reread).execute();
}

} // namespace

std::function<int()> prepareRun(CLI::App& command) {
    const auto options = std::make_shared<RunOptions>();
    addRunOptions(command, *options);
    return [options, &command] { return run(wordsOf(command)); };
}

} // namespace vantelhost
