/// @file
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace vantelhost {

/// A key of a configuration file, with its value.
struct ConfigEntry {
    std::string key;
    std::vector<std::string> values; ///< their texts without quotes; one unless it is an array
    bool isArray = false;
    std::size_t line = 0;
    std::string place; ///< "FILE:LINE", for messages
};

struct ConfigError {
    std::size_t line;
    std::string text; ///< "FILE:LINE: ..."
};

/// A configuration file: TOML as CLI11 has it. Each key stands on a line of its own; texts have no
/// escapes, and words need no quotes. All are in the file's order.
struct ConfigFile {
    std::vector<ConfigEntry> options;  ///< of the program: what stands above the section
    std::vector<ConfigEntry> settings; ///< of the plug-in: what stands in the section [settings]
    std::vector<ConfigError> errors;
};

/// @param name the file's, for messages
ConfigFile readConfigFile(const std::string& text, const std::string& name);

/// Whether the text is to be read as JSON: its first character that is not blank is "{".
bool isJsonText(const std::string& text);

} // namespace vantelhost
