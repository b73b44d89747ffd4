/// @file
/// The command line of ptp4l, as far as it matters here.
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace simptp4l {

struct CommandLine {
    std::optional<std::string> config;   ///< -f
    std::optional<std::string> script;   ///< --script; else the configuration file plus ".sim"
    std::vector<std::string> interfaces; ///< each -i, in order
    bool help = false;
    bool check = false; ///< --check: only read configuration and script
    std::string error;  ///< what is wrong with the command line; empty when nothing is
};

/// Reads the arguments after the program's name. Other options of ptp4l, and any other long option
/// with its value, are skipped.
CommandLine readCommandLine(const std::vector<std::string>& arguments);

/// The text that --help shows.
const char* helpText();

} // namespace simptp4l
