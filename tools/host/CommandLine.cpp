#include "CommandLine.h"

#include <algorithm>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Numbers.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

constexpr char footer[] =
    "Exit status: 0 after a clean run; 1 when the plug-in reported an error or broke the rules of\n"
    "the interface, or the output was lost; 2 for a bad option, setting, library or FIFO.";

[[noreturn]] void refuse(const std::string& option, const std::string& expected,
                         const std::string& text) {
    throw CLI::ValidationError(option, fmt::format("must be {}, not \"{}\"", expected, text));
}

std::int64_t integer(const std::string& option, const std::string& text) {
    const auto value = parseInteger(text);
    if (!value) {
        refuse(option, "an integer of nanoseconds", text);
    }
    return *value;
}

TimedOffset timedOffset(const std::string& option, const std::string& text) {
    const auto colon = text.find(':');
    const auto seconds = parseSeconds(text.substr(0, colon));
    const auto offset =
        colon == std::string::npos ? std::nullopt : parseInteger(text.substr(colon + 1));
    if (!seconds || !offset) {
        refuse(option, "SECONDS:NS", text);
    }
    return {*seconds, *offset};
}

void addSettings(CLI::App& command, RunOptions& options) {
    command
        .add_option("--config", options.configFile,
                    "File with the settings, a JSON object; - "
                    "is the standard input")
        ->type_name("FILE");
    command.add_option("--set", options.assignments, "One setting, typed by the plug-in's schema")
        ->type_name("KEY=VALUE")
        ->expected(1)
        ->take_all();
    auto* interfaces =
        command.add_option("--interface", options.interfaces, "A network interface; repeatable")
            ->type_name("NAME")
            ->expected(1)
            ->take_all();
    command.add_flag("--no-interfaces", options.noInterfaces, "Allow a clock without interfaces")
        ->excludes(interfaces);
}

void addBehaviour(CLI::App& command, RunOptions& options) {
    command
        .add_option_function<std::string>(
            "--seconds",
            [&options](const std::string& text) {
                options.seconds = parseSeconds(text);
                if (!options.seconds) {
                    refuse("--seconds", "a number of seconds", text);
                }
            },
            "Stop after this time; else at SIGINT or SIGTERM")
        ->type_name("N");
    command.add_flag("--json", options.jsonLines, "Print JSON Lines");
    command.add_flag("--refuse-while-stopping", options.refuseWhileStopping,
                     "Refuse the plug-in's calls while stopping");
}

void addFifo(CLI::App& command, RunOptions& options) {
    command.add_option("--fifo", options.fifo, "The FIFO of epoch offsets")
        ->type_name("PATH")
        ->capture_default_str();
    command.add_flag("--create-fifo", options.createFifo,
                     "Create the FIFO if it is absent, and remove it at the end");
    command
        .add_option_function<std::string>(
            "--epoch-offset",
            [&options](const std::string& text) {
                options.epochOffset = integer("--epoch-offset", text);
            },
            "Write this epoch offset before the start")
        ->type_name("NS");
    command
        .add_option_function<std::vector<std::string>>(
            "--epoch-offset-at",
            [&options](const std::vector<std::string>& texts) {
                for (const auto& text : texts) {
                    options.timedOffsets.push_back(timedOffset("--epoch-offset-at", text));
                }
            },
            "Write an epoch offset some time after the start; repeatable")
        ->type_name("SECONDS:NS")
        ->expected(1)
        ->take_all();
}

void finish(RunOptions& options, bool fifoNamed) {
    options.useFifo =
        fifoNamed || options.createFifo || options.epochOffset || !options.timedOffsets.empty();
    std::stable_sort(options.timedOffsets.begin(), options.timedOffsets.end(),
                     [](const auto& a, const auto& b) { return a.seconds < b.seconds; });
}

CLI::Option* addLibrary(CLI::App& command, std::string& library) {
    return command.add_option("--library", library, "The plug-in")
        ->type_name("PATH")
        ->capture_default_str();
}

} // namespace

std::variant<int, RunOptions, SchemaOptions> readCommandLine(int argc, const char* const* argv) {
    CLI::App app("A host for the boundary clock plug-in.", "vantel-host");
    app.require_subcommand(1);
    app.footer(footer);

    RunOptions runOptions;
    auto& run = *app.add_subcommand("run", "Run the plug-in and show what it reports");
    addLibrary(run, runOptions.pluginPath);
    addSettings(run, runOptions);
    addBehaviour(run, runOptions);
    addFifo(run, runOptions);
    run.footer(footer);

    SchemaOptions schemaOptions;
    auto& schema = *app.add_subcommand("schema", "Show the plug-in's parameters");
    addLibrary(schema, schemaOptions.pluginPath);
    schema.add_flag("--json", schemaOptions.raw, "Show the schema's own text");

    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? exitClean : exitUsage;
    }
    if (schema.parsed()) {
        return schemaOptions;
    }
    finish(runOptions, run.count("--fifo") > 0);
    return runOptions;
}

} // namespace vantelhost
