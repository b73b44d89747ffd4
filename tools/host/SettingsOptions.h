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
};

/// Adds the options to a command. They are filled when the command line is read.
void addSettingsOptions(CLI::App& command, SettingsOptions& options);

/// The content of the configuration file; nothing when there is none. Throws UsageError.
std::optional<std::string> readConfig(const SettingsOptions& options);

/// @param configText as readConfig gave it
UserSettings userSettings(const SettingsOptions& options, std::optional<std::string> configText);

} // namespace vantelhost
