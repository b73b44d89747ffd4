/// @file
#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <string>

#include "PlugIn.h"
#include "SessionPlan.h"
#include "SoakHost.h"
#include "support/EpochFifo.h"

/// One session, with what its plan wants to go wrong. Needs a working folder of its own.
class SessionRun {
public:
    SessionRun(const vantelhost::PlugIn& plugIn, SoakHost& host, const SessionPlan& plan);

    /// @param program the simulated daemon.
    /// @param goesOn  called all the time; false ends the session early.
    /// @return what went wrong; empty when all was well.
    std::string run(const std::string& program, const std::function<bool()>& goesOn);

    /// Since the start of the session.
    double seconds() const;

    /// How long zekeltr_stop took.
    double stopSeconds() const { return stopSeconds_; }

private:
    using Clock = SoakHost::Clock;

    void provideDaemon(const std::string& program) const;
    std::string initialise();
    std::string start();
    std::string attend(const std::function<bool()>& goesOn);
    std::string end();
    double stopLimit() const;
    bool isOver();
    bool hasRecovered();
    std::string overdue() const;
    void performDeeds();
    void perform(const Deed& deed);
    void feedFifo();
    void write(const std::string& octets) const;

    const vantelhost::PlugIn& plugIn_;
    SoakHost& host_;
    const SessionPlan& plan_;
    std::optional<EpochFifo> fifo_;
    void* slot_ = nullptr;
    Clock::time_point begin_ = Clock::now();
    std::size_t performed_ = 0;
    double nextOffset_ = 0;
    bool fifoIsTorn_ = false;
    bool daemonIsFrozen_ = false;
    double stopSeconds_ = 0;
    std::uint64_t deathsBefore_;
    std::optional<SoakHost::Counts> beforeRecovery_;
};
