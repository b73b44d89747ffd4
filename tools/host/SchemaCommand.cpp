#include "SchemaCommand.h"

#include <cstdio>
#include <memory>
#include <string>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Events.h"
#include "HostStatus.h"
#include "PlugIn.h"
#include "SchemaTable.h"
#include "Text.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

struct SchemaOptions {
    std::string pluginPath = "libvantel_bc.so.19";
    bool raw = false;
};

std::string shownStatus(const HostStatus& status) {
    return statusEvent("schema", status.code(), status.text()).text;
}

int showSchema(const SchemaOptions& options) {
    const PlugIn plugIn(options.pluginPath);
    HostStatus status;
    const std::string text = plugIn.schema(status);
    if (status.isError()) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(shownStatus(status)));
        return exitFailed;
    }
    try {
        writeOutput(options.raw ? text : schemaTable(parseSchema(text)));
        return exitClean;
    } catch (const SchemaError& error) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error.what()));
        return exitFailed;
    }
}

} // namespace

std::function<int()> prepareSchema(CLI::App& command) {
    const auto options = std::make_shared<SchemaOptions>();
    command.add_option("--library", options->pluginPath, "The plug-in")
        ->type_name("PATH")
        ->capture_default_str();
    command.add_flag("--json", options->raw, "Show the schema's own text");
    return [options] { return showSchema(*options); };
}

} // namespace vantelhost
