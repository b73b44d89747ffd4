/// @file
/// The options that say which plug-in gets which settings.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "Settings.h"

namespace CLI {
class App;
}

namespace vantelhost {

struct SettingsOptions {
    std::string pluginPath = "libvantel_bc.so.19";
    std::string configFile; ///< "-" is the standard input; empty when there is none
    std::vector<std::string> assignments;
    std::vector<std::string> interfaces;
    bool noInterfaces = false;
    std::vector<ConfigEntry> fileSettings; ///< of the configuration file, when it is no JSON
};

/// Adds the options to a command. They are filled when the command line is read.
void addSettingsOptions(CLI::App& command, SettingsOptions& options);

/// What stands in a configuration file: a JSON object, or else options and settings.
struct Config {
    std::optional<std::string> json;
    ConfigFile file;
};

/// Reads the configuration file, if there is one. Throws UsageError.
Config readConfig(const SettingsOptions& options);

/// @param json that of the configuration file, if it is one
UserSettings userSettings(const SettingsOptions& options, std::optional<std::string> json);

} // namespace vantelhost
