#include "RunCommand.h"

#include <memory>
#include <utility>

#include <CLI/CLI.hpp>

#include "Run.h"
#include "RunConfig.h"
#include "RunOptions.h"
#include "Signals.h"

namespace vantelhost {

namespace {

/// Reads the settings before the signals are blocked: Ctrl-C still ends a wait for typed ones.
int run(const Words& commandLine) {
    RunConfig config = readRunConfig(commandLine);
    refuseBadFile(config.errors);
    Signals signals;
    return Run(config.options, std::move(config.json), signals).execute();
}

} // namespace

std::function<int()> prepareRun(CLI::App& command) {
    const auto options = std::make_shared<RunOptions>();
    addRunOptions(command, *options);
    return [options, &command] { return run(wordsOf(command)); };
}

} // namespace vantelhost
