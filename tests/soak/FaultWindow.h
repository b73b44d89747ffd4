/// @file
#pragma once

#include <cstddef>
#include <string>

#include "Dice.h"
#include "SessionPlan.h"

/// A stretch of time in a session's plan in which something goes wrong. At its end all is well
/// again.
class FaultWindow {
public:
    FaultWindow(SessionPlan& plan, Dice& dice, double from, double until);

    /// The kinds of faults, from 0.
    static constexpr std::size_t kinds = 26;

    /// Adds a fault of a kind to the plan.
    void add(std::size_t kind);

private:
    struct Kind;
    static const std::array<Kind, kinds> table;

    void onRequests(const std::string& action);
    void at(double time, const std::string& action);
    void between(Deed::What begin, Deed::What end);
    void host(HostFault fault);
    void delay();
    void clockStep();

    SessionPlan& plan_;
    Dice& dice_;
    double from_;
    double until_;
};
