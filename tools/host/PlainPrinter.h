/// @file
#pragma once

#include <cstdint>
#include <map>
#include <string>

#include "EventPrinter.h"

namespace vantelhost {

/// Writes events as lines for people, and each thing once: an event that says what the last one of
/// its name said is counted. The count is told before that changes, and before the run stops. What
/// is expected of a run that a signal ends is left out. Not thread-safe.
class PlainPrinter {
public:
    /// @param descriptor not owned.
    explicit PlainPrinter(int descriptor) : print_(descriptor, Format::readable) {}

    /// @return false when a line could not be written; errno says why.
    bool operator()(const Event& event, const Moment& moment);

private:
    struct Last {
        std::string text;
        std::uint64_t repetitions = 0;
    };

    bool tellRepetitions(const std::string& name, Last& last, const Moment& moment) const;
    bool tellAllRepetitions(const Moment& moment);

    EventPrinter print_;
    std::map<std::string, Last> last_; ///< by the event's name
};

} // namespace vantelhost
