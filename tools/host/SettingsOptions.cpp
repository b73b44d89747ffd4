#include "SettingsOptions.h"

#include <cerrno>
#include <fstream>
#include <iostream>
#include <iterator>
#include <utility>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

constexpr char standardInput[] = "the standard input";

[[noreturn]] void refuseToRead(const std::string& name) {
    throw UsageError(fmt::format("cannot read {}: {}", name, errorText(errno)));
}

std::string readAll(std::istream& stream, const std::string& name) {
    try {
        return {std::istreambuf_iterator<char>(stream), {}};
    } catch (const std::ios_base::failure&) { // a folder, for example
        refuseToRead(name);
    }
}

} // namespace

void addSettingsOptions(CLI::App& command, SettingsOptions& options) {
    command.add_option("--library", options.pluginPath, "The plug-in")
        ->type_name("PATH")
        ->capture_default_str();
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

std::optional<std::string> readConfig(const SettingsOptions& options) {
    const std::string& name = options.configFile;
    if (name.empty()) {
        return std::nullopt;
    }
    if (name == "-") {
        return readAll(std::cin, standardInput);
    }
    std::ifstream file(name, std::ios::binary);
    if (!file) {
        refuseToRead(name);
    }
    return readAll(file, name);
}

UserSettings userSettings(const SettingsOptions& options, std::optional<std::string> configText) {
    return {std::move(configText), options.configFile == "-" ? standardInput : options.configFile,
            options.assignments, options.interfaces, !options.noInterfaces};
}

} // namespace vantelhost
