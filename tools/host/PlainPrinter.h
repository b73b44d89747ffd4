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
    enum class Detail { all, quiet }; ///< quiet: neither time pairs nor metadata

    /// @param descriptor not owned.
    explicit PlainPrinter(int descriptor, Detail detail = Detail::all)
        : print_(descriptor, Format::readable), detail_(detail) {}

    /// @return false when a line could not be written; errno says why.
    bool operator()(const Event& event, const Moment& moment);

private:
    struct Last {
        std::string text;
        std::uint64_t repetitions = 0;
    };

    bool isLeftOut(const std::string& name) const;
    bool tellRepetitions(const std::string& name, Last& last, const Moment& moment) const;
    bool tellAllRepetitions(const Moment& moment);

    EventPrinter print_;
    Detail detail_;
    std::map<std::string, Last> last_; ///< by the event's name
};

} // namespace vantelhost
