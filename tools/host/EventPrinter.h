/// @file
#pragma once

#include <string>

#include "Events.h"
#include "Moment.h"

namespace vantelhost {

/// The event as a line of JSON, without its end.
std::string jsonLine(const Event& event, const Moment& moment);

enum class Format { readable, jsonLines };

/// Writes events to a descriptor, one line each, in one piece and at once. Not thread-safe.
class EventPrinter {
public:
    /// @param descriptor not owned.
    EventPrinter(int descriptor, Format format);

    /// @return false when the line could not be written; errno says why.
    bool operator()(const Event& event, const Moment& moment) const;

private:
    int descriptor_;
    Format format_;
};

} // namespace vantelhost
