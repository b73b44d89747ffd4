/// @file
/// From the user's settings to the protocol configuration that the plug-in gets.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "ConfigFile.h"
#include "Json.h"
#include "Schema.h"

namespace vantelhost {

/// What the user gave. Later sources win: text or entries, assignments, interfaces.
struct UserSettings {
    std::optional<std::string> text;      ///< a JSON object
    std::string textName;                 ///< the file that it is from
    std::vector<ConfigEntry> entries;     ///< of a file that is no JSON
    std::vector<std::string> assignments; ///< each "key=value"
    std::vector<std::string> interfaces;
    bool interfacesRequired = true;
};

struct Settings {
    Json values = Json::object();      ///< complete: the schema's keys, "interface", then the rest
    std::vector<std::string> errors;   ///< one per bad key, with file and line if it is from a file
    std::vector<std::string> warnings; ///< the same for keys that the schema does not know
};

/// Completes and checks the settings. The values are of use only when there are no errors.
Settings completeSettings(const Schema& schema, const UserSettings& user);

} // namespace vantelhost
