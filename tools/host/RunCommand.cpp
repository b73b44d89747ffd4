#include "RunCommand.h"

#include <memory>
#include <utility>

#include "Run.h"
#include "RunOptions.h"
#include "SettingsOptions.h"
#include "Signals.h"

namespace vantelhost {

namespace {

/// Reads the settings before the signals are blocked: Ctrl-C still ends a wait for typed ones.
int run(const RunOptions& options) {
    auto configText = readConfig(options);
    Signals signals;
    return Run(options, std::move(configText), signals).execute();
}

} // namespace

std::function<int()> prepareRun(CLI::App& command) {
    const auto options = std::make_shared<RunOptions>();
    addRunOptions(command, *options);
    return [options] { return run(*options); };
}

} // namespace vantelhost
