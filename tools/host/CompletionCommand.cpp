#include "CompletionCommand.h"

#include <CLI/CLI.hpp>

#include "Completion.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

std::function<int()> prepareCompletion(CLI::App& command) {
    command.footer("For the shell that runs: source <(vantel-host completion)");
    return [&command] {
        writeOutput(bashCompletion(*command.get_parent()));
        return exitClean;
    };
}

} // namespace vantelhost
