#include "SettingsOptions.h"

#include <algorithm>
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

std::string readFile(const std::string& name) {
    std::ifstream file(name, std::ios::binary);
    if (!file) {
        refuseToRead(name);
    }
    return readAll(file, name);
}

std::string nameOf(const SettingsOptions& options) {
    return options.configFile == "-" ? standardInput : options.configFile;
}

/// What stands behind --set in a file becomes settings, that keep their line.
void moveAssignments(ConfigFile& file) {
    const auto isAssignment = [](const auto& entry) { return entry.key == "set"; };
    for (const auto& entry : file.options) {
        for (const auto& value : isAssignment(entry) ? entry.values : std::vector<std::string>()) {
            const auto equals = value.find('=');
            if (equals == std::string::npos || equals == 0) {
                file.errors.push_back(
                    {entry.line, fmt::format("{}: set: must be \"key=value\", not {}", entry.place,
                                             shown(value))});
            } else {
                file.settings.push_back({value.substr(0, equals),
                                         {value.substr(equals + 1)},
                                         false,
                                         entry.line,
                                         entry.place});
            }
        }
    }
    file.options.erase(std::remove_if(file.options.begin(), file.options.end(), isAssignment),
                       file.options.end());
}

} // namespace

void addSettingsOptions(CLI::App& command, SettingsOptions& options) {
    command.add_option("--library", options.pluginPath, "The plug-in")
        ->type_name("PATH")
        ->capture_default_str();
    command
        .add_option("--config", options.configFile,
                    "File with options and settings, see vantel-host.toml(5), or with settings "
                    "alone, a JSON object; - is the standard input")
        ->configurable(false)
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

Config readConfig(const SettingsOptions& options) {
    if (options.configFile.empty()) {
        return {};
    }
    const std::string name = nameOf(options);
    std::string text = options.configFile == "-" ? readAll(std::cin, name) : readFile(name);
    if (isJsonText(text)) {
        return {std::move(text), {}};
    }
    Config config{std::nullopt, readConfigFile(text, name)};
    moveAssignments(config.file);
    return config;
}

UserSettings userSettings(const SettingsOptions& options, std::optional<std::string> json) {
    return {std::move(json),     nameOf(options),    options.fileSettings,
            options.assignments, options.interfaces, !options.noInterfaces};
}

} // namespace vantelhost
