/// @file
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "Events.h"
#include "Json.h"
#include "RunConfig.h"
#include "Schema.h"

namespace vantelhost {

/// What a configuration file says when it is read again during a run.
struct ConfigChange {
    std::vector<std::string> errors;    ///< with any, the file has no effect, and the rest is empty
    std::vector<std::string> warnings;  ///< of keys that the plug-in does not know
    std::optional<Json> settings;       ///< all of the plug-in's, when they have changed
    std::vector<std::string> startOnly; ///< options that have changed, and need a new start
};

/// Whether the configuration file can be read again: there is one, and not the standard input.
bool canReread(const SettingsOptions& options);

/// Reads the configuration file again. Changes nothing.
/// @param commandLine as for readRunConfig()
/// @param inUse       what the run began with
/// @param settings    the plug-in's, that it has now
ConfigChange rereadConfig(const Words& commandLine, const RunConfig& inUse, const Schema& schema,
                          const Json& settings);

/// The event "reread": what is done about it.
Event rereadEvent(const ConfigChange& change);

} // namespace vantelhost
