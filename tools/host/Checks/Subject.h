/// @file
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "BuiltPaths.h"
#include "Checks/TimeStamping.h"
#include "Json.h"

namespace vantelhost {

/// What is checked, and where the machine shows itself.
struct Subject {
    /// The paths that are compiled into the plug-in.
    std::string daemon = builtPtp4l;
    std::string socketPrefix = builtSocketPrefix; ///< the process id follows
    std::string fifo = builtEpochFifo;
    std::string usualDaemon = "/usr/sbin/ptp4l"; ///< where Debian has it
    bool createFifo = false;                     ///< by whoever will run the plug-in
    bool writeFifo = false;                      ///< the same
    bool software = false;                       ///< the daemon will take time stamps in software

    std::vector<std::string> interfaces;
    std::optional<Json> settings;        ///< complete and accepted, if there are such
    std::optional<std::string> rendered; ///< the file that the plug-in wrote, if it did

    std::string proc = "/proc";
    std::string dev = "/dev";
    TimeStamping (*timeStamping)(const std::string& interface) = readTimeStamping;
};

/// A setting that is a string; nothing when there are no settings, or it is none.
inline std::optional<std::string> setting(const Subject& subject, const char* key) {
    if (!subject.settings || !subject.settings->contains(key) ||
        !subject.settings->at(key).is_string()) {
        return std::nullopt;
    }
    return subject.settings->at(key).get<std::string>();
}

} // namespace vantelhost
