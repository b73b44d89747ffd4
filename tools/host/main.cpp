// vantel-host: loads the boundary clock plug-in and shows what it reports.

#include <cstdio>
#include <exception>

#include <fmt/format.h>

#include "CheckCommand.h"
#include "CommandLine.h"
#include "CompletionCommand.h"
#include "ReportCommand.h"
#include "RunCommand.h"
#include "SchemaCommand.h"
#include "StatusCommand.h"
#include "Text.h"
#include "UsageError.h"

int main(int argc, char** argv) {
    using namespace vantelhost;
    try {
        return execute({{"run", "Run the plug-in and show what it reports", prepareRun},
                        {"check", "Say what would keep the plug-in from working", prepareCheck},
                        {"report", "Make a page of a recording", prepareReport},
                        {"schema", "Show the plug-in's parameters", prepareSchema},
                        {"status", "Ask a run how it stands", prepareStatus},
                        {"completion", "Show the completion for bash", prepareCompletion}},
                       argc, argv);
    } catch (const UsageError& error) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error.what()));
        return exitUsage;
    } catch (const std::exception& error) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error.what()));
        return exitFailed;
    }
}
