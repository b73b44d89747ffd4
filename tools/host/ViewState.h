/// @file
#pragma once

#include <cstdint>
#include <deque>
#include <optional>
#include <string>

#include "Events.h"
#include "Json.h"
#include "OffsetWindow.h"

namespace vantelhost {

/// What the live view shows. Times are seconds since the beginning of the run.
struct ViewState {
    struct Problem {
        double seconds;
        std::string text;
    };

    std::string plugIn; ///< its name; empty until it is loaded
    std::string phase = "starting";
    bool started = false;
    std::string quality; ///< empty until there is one
    std::string reason;
    double qualitySince = 0;
    Json metadata = Json::object();
    std::optional<std::int64_t> offset; ///< of the last pair, in nanoseconds
    std::uint64_t pairs = 0;
    OffsetWindow offsets{60};
    std::string chrony;           ///< empty when chronyd gets nothing
    std::deque<Problem> problems; ///< the last five, oldest first
};

/// Takes what an event says.
void update(ViewState& state, const Event& event, double seconds);

} // namespace vantelhost
