/// @file
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "OptionWords.h"
#include "RunOptions.h"

namespace vantelhost {

/// What the command line and the configuration file say of a run. The command line wins.
struct RunConfig {
    RunOptions options;
    OptionValues values;             ///< the same as texts
    std::optional<std::string> json; ///< the settings, if the file is a JSON object
    std::vector<std::string> errors; ///< of the file, each with its line
};

/// Reads the configuration file that the command line names, if it does.
/// @param commandLine the words of "run" that it had, as wordsOf() gives them
/// Throws UsageError when the file cannot be read.
RunConfig readRunConfig(const Words& commandLine);

/// What is wrong with a configuration file, but for the plug-in's settings. All commands that take
/// it judge it alike, by the options of "run". In the order of its lines.
/// @param commandLine what stands beside it: the words of "run"
std::vector<std::string> complaintsAbout(const ConfigFile& file, const Words& commandLine = {});

/// Tells the errors, and throws UsageError if there are any.
void refuseBadFile(const std::vector<std::string>& errors);

} // namespace vantelhost
