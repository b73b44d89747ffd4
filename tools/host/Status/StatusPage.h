/// @file
#pragma once

#include <cstdint>
#include <mutex>
#include <optional>
#include <string>

#include "Events.h"
#include "Json.h"
#include "Moment.h"
#include "OffsetWindow.h"
#include "ViewState.h"

namespace vantelhost {

/// What "vantel-host status" is answered: how a run stands. Thread-safe.
class StatusPage {
public:
    /// Takes what an event says.
    void take(const Event& event, const Moment& moment);

    void takeChrony(const ChronyCounts& counts);

    /// @param now seconds since the beginning of the run
    Json at(double now) const;

private:
    struct State {
        ViewState view;
        OffsetWindow minute{60}; ///< without those left out, as the next
        OffsetWindow hour{3600};
        std::optional<ChronyCounts> chrony;
        std::string chronyProblem; ///< empty while chronyd takes the pairs
    };

    mutable std::mutex mutex_;
    State state_;
};

} // namespace vantelhost
