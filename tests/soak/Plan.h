/// @file
#pragma once

#include <cstdint>

#include "Dice.h"
#include "FaultWindow.h"
#include "SessionPlan.h"

/// Plans session after session: the same ones for the same seed and duration.
class Plan {
public:
    Plan(std::uint64_t seed, int seconds);

    /// @return false when the time is used up; the last session is one that recovers.
    bool next(SessionPlan& session);

    /// From the end of the faults, the grandmaster goes and comes once more: a new role is what
    /// makes the plug-in send the quality again. The time at which it comes.
    static double lastRole(const SessionPlan& session);

private:
    void begin(SessionPlan& session, Ending ending);
    void addFaults(SessionPlan& session);
    void end(SessionPlan& session);

    static constexpr std::size_t otherEndings = 9;

    Dice dice_;
    Deck<FaultWindow::kinds> faults_;
    Deck<otherEndings> endings_;
    double seconds_;
    double planned_ = 0;
    bool recovers_ = true;
};
