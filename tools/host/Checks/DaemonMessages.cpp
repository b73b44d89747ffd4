#include "Checks/DaemonMessages.h"

#include <optional>
#include <sstream>

#include "Numbers.h"

namespace vantelhost {

namespace {

using Names = DaemonMessage::Names;

/// What a message names in a line; nothing when the line is another message.
std::optional<std::string> namedIn(const std::string& line, const DaemonMessage& message) {
    const std::string before = message.before;
    const auto begin = line.find(before);
    if (begin == std::string::npos) {
        return std::nullopt;
    }
    const auto end = line.find(message.after, begin + before.size());
    return end == std::string::npos
               ? std::nullopt
               : std::optional(line.substr(begin + before.size(), end - begin - before.size()));
}

/// The first word of a line; empty when there is no such line.
std::string optionInLine(const std::string& file, const std::string& number) {
    std::istringstream lines(file);
    std::string line;
    std::string option;
    for (auto left = parseInteger(number).value_or(0); left > 0 && lines; --left) {
        std::getline(lines, line);
    }
    std::istringstream(line) >> option;
    return option;
}

} // namespace

const std::array<DaemonMessage, 6> daemonMessages = {{
    {" is a bad value for option ", " at line ", Names::option, "3.1 3.1.1 4.2"},
    {" is a malformed value for option ", " at line ", Names::option, "3.1 3.1.1 4.2"},
    {" is an out of range value for option ", " at line ", Names::option, "3.1 3.1.1 4.2"},
    {"unknown option ", " at line ", Names::option, "3.1 3.1.1 4.2"},
    {"could not parse line ", " in ", Names::line, "3.1 3.1.1 4.2"},
    // Its last complaint, when it was started without one.
    {"no interface specified", "", Names::nothing, "3.1 3.1.1 4.2"},
}};

Answer understand(const std::string& output, const std::string& file) {
    std::istringstream lines(output);
    for (std::string line; std::getline(lines, line);) {
        for (const auto& message : daemonMessages) {
            if (const auto named = namedIn(line, message)) {
                switch (message.names) {
                case Names::nothing:
                    return {true, {}};
                case Names::option:
                    return {false, *named};
                case Names::line:
                    return {false, optionInLine(file, *named)};
                }
            }
        }
    }
    return {};
}

} // namespace vantelhost
