/// @file
/// Options as the words of a command line, from wherever they come.
#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

#include "ConfigFile.h"

namespace vantelhost {

using Words = std::vector<std::string>;

/// The texts of each option that is given, by its long name.
using OptionValues = std::map<std::string, std::vector<std::string>>;

OptionValues valuesOf(const CLI::App& command);

/// The options that a command got.
Words wordsOf(const CLI::App& command);

/// What the entries of a file add to them: those that the command takes from files, and that the
/// command line neither gives nor excludes.
Words wordsToAdd(const CLI::App& command, const std::vector<ConfigEntry>& entries);

/// What is wrong with the entries as options of a command: one for each that is. What an entry
/// needs may stand anywhere among them, or on the command line.
/// @param command has read the command line
/// @param parse   reads words as a new command with options of its own, and throws CLI::ParseError
std::vector<ConfigError> complaintsAbout(const std::vector<ConfigEntry>& entries,
                                         const CLI::App& command,
                                         const std::function<void(const Words&)>& parse);

/// Lets a command read words. Throws CLI::ParseError.
void parseWords(CLI::App& command, const Words& words);

/// Options of a type, such as RunOptions, and the command that has read them.
template <class Options>
struct ParsedOptions {
    /// Throws CLI::ParseError.
    /// @param add adds the options to a command
    ParsedOptions(const Words& words, void (*add)(CLI::App&, Options&)) {
        add(command, options);
        parseWords(command, words);
    }

    Options options;
    CLI::App command;
};

} // namespace vantelhost
