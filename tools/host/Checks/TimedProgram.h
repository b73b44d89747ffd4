/// @file
#pragma once

#include <chrono>
#include <string>
#include <vector>

namespace vantelhost {

/// How a program ended.
struct ProgramEnd {
    int error = 0;         ///< errno when it could not be started
    bool timedOut = false; ///< it was killed
    int status = 0;        ///< as waitpid gives it; of use when neither of the above holds
    std::string output;    ///< both outputs, at most 64 KiB
};

/// Runs a program as the plug-in does: without a shell and with an empty environment. It reads
/// nothing. What it started is killed with it when the time is over.
/// @param command the program's path and its arguments
ProgramEnd runTimed(const std::vector<std::string>& command, std::chrono::milliseconds longest);

} // namespace vantelhost
