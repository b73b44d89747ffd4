#include "SchemaCommand.h"

#include <cstdio>
#include <memory>
#include <string>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "ConfigTemplate.h"
#include "Events.h"
#include "HostStatus.h"
#include "PlugIn.h"
#include "RunOptions.h"
#include "SchemaTable.h"
#include "Text.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

struct SchemaOptions {
    std::string pluginPath = "libvantel_bc.so.19";
    bool raw = false;
    bool configFile = false;
};

std::string shownStatus(const HostStatus& status) {
    return statusEvent("schema", status.code(), status.text()).text;
}

/// Throws SchemaError.
std::string shownAs(const SchemaOptions& options, const std::string& text) {
    if (options.raw) {
        return text;
    }
    const Schema schema = parseSchema(text);
    if (!options.configFile) {
        return schemaTable(schema);
    }
    RunOptions defaults;
    defaults.pluginPath = options.pluginPath;
    CLI::App run;
    addRunOptions(run, defaults);
    return configTemplate(run, schema);
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
        writeOutput(shownAs(options, text));
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
    auto* raw = command.add_flag("--json", options->raw, "Show the schema's own text");
    command
        .add_flag("--config-file", options->configFile,
                  "Show a file for --config, with all options of \"run\" and all parameters")
        ->excludes(raw);
    return [options] { return showSchema(*options); };
}

} // namespace vantelhost
