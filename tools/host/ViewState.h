/// @file
#pragma once

#include <cstdint>
#include <deque>
#include <optional>
#include <string>

#include "Events.h"
#include "Json.h"
#include "OffsetWindow.h"
#include "Tally.h"

namespace vantelhost {

/// What the live view shows. Times are seconds since the beginning of the run.
struct ViewState {
    struct Problem {
        double seconds; ///< the last time
        std::string text;
        std::uint64_t times = 1; ///< in a row
    };

    std::string plugIn; ///< its name; empty until it is loaded
    std::string phase = "starting";
    bool started = false;
    std::string health = "starting";
    std::string healthReason; ///< empty as long as it is the first one
    double healthSince = 0;
    std::uint64_t restarts = 0;
    std::string quality; ///< empty until there is one
    std::string reason;
    double qualitySince = 0;
    std::string daemonEnd; ///< how ptp4l ended unasked; empty while it runs
    Json metadata = Json::object();
    std::optional<std::int64_t> offset; ///< of the last pair, in nanoseconds
    double offsetSeconds = 0;           ///< when it came
    OffsetStatistics allOffsets;
    LeftOutCounts leftOut; ///< of the pairs
    OffsetWindow offsets{60};
    std::string chrony;           ///< empty when chronyd gets nothing
    std::deque<Problem> problems; ///< the last five, oldest first
};

/// Takes what an event says.
void update(ViewState& state, const Event& event, double seconds);

} // namespace vantelhost
