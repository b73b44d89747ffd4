/// @file
/// What ptp4l says of its file, as far as it is understood.
#pragma once

#include <array>
#include <string>

namespace vantelhost {

struct DaemonMessage {
    enum class Names {
        nothing, ///< the file is taken
        option,  ///< which is refused, or its value
        line     ///< of the file, by its number, which is refused
    };

    const char* before; ///< what stands in a line of ptp4l before what is named
    const char* after;
    Names names;
    const char* versions; ///< of linuxptp, in which it was seen
};

/// In the order in which they are looked for.
extern const std::array<DaemonMessage, 6> daemonMessages;

struct Answer {
    bool isTaken = false;
    std::string option; ///< of ptp4l, which is refused; empty when none is named
};

/// What the first line of ptp4l's output says that is understood.
/// @param file what ptp4l was given
Answer understand(const std::string& output, const std::string& file);

} // namespace vantelhost
