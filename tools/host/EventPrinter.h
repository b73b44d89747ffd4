/// @file
#pragma once

#include <chrono>
#include <string>

#include "Events.h"

namespace vantelhost {

enum class Format { readable, jsonLines };

/// Writes events to a descriptor, one line each, in one piece and at once. Not thread-safe.
class EventPrinter {
public:
    using Clock = std::chrono::steady_clock;

    /// @param descriptor not owned.
    /// @param begin      the times shown are seconds since then.
    EventPrinter(int descriptor, Format format, Clock::time_point begin = Clock::now());

    /// @return false when the line could not be written.
    bool print(const Event& event);

    /// Seconds since the beginning.
    double seconds() const;

private:
    std::string line(const Event& event) const;

    int descriptor_;
    Format format_;
    Clock::time_point begin_;
};

} // namespace vantelhost
