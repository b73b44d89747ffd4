/// @file
/// What the process was given by whoever started it.
#pragma once

#include <string>
#include <vector>

namespace simptp4l {

struct StartRecord {
    std::vector<std::string> argv;
    std::vector<std::string> environment; ///< "NAME=value", as given
    std::vector<int> openDescriptors;     ///< ascending
    std::vector<std::string> blockedSignals;
    std::vector<std::string> ignoredSignals;
    int pid = 0;
};

/// To be called first in main: before anything opens a descriptor or touches a signal.
StartRecord recordStart(int argc, char** argv);

/// "SIGTERM" and so on; a number for a signal without a name.
std::string signalName(int number);

} // namespace simptp4l
