/// @file
#pragma once

#include <cstdint>
#include <mutex>
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

    /// How many time pairs chronyd took, and how many it did not.
    void takeChrony(std::uint64_t sent, std::uint64_t failed);

    /// @param now seconds since the beginning of the run
    Json at(double now) const;

private:
    struct State {
        ViewState view;
        OffsetWindow minute{60}; ///< without those left out, as the next
        OffsetWindow hour{3600};
        bool hasChrony = false;
        std::string chronyProblem; ///< empty while chronyd takes the pairs
        std::uint64_t sent = 0;
        std::uint64_t failed = 0;
    };

    mutable std::mutex mutex_;
    State state_;
};

} // namespace vantelhost
