/// @file
#pragma once

#include <chrono>
#include <cstdint>
#include <map>
#include <string>

#include "Holdings.h"
#include "PlugIn.h"
#include "SessionPlan.h"
#include "SessionRun.h"
#include "SoakHost.h"
#include "support/TemporaryFolder.h"

/// Runs session after session of the plug-in in this process, watches what the process holds, and
/// tells of it on stdout.
class Soak {
public:
    struct Options {
        int seconds = 600;
        std::uint64_t seed = 1;
        std::string plugIn;     ///< the library
        std::string daemon;     ///< the simulated one
        std::string skipMemory; ///< why memory cannot be judged here; empty: it can
    };

    /// @param interrupted becomes true when the soak is to end early.
    Soak(Options options, const volatile int& interrupted);

    /// @return whether all was well.
    bool run();

private:
    using Clock = SoakHost::Clock;

    /// Of the sessions that ended alike.
    struct Stops {
        std::uint64_t count = 0;
        double longest = 0; ///< s that zekeltr_stop took
    };

    void runSession(const SessionPlan& plan);
    bool watch();
    void takeStock(const SessionPlan& plan, double stopSeconds);
    void judge();
    void report() const;
    void reportProgress() const;
    void reportFaults() const;
    void reportHoldings() const;
    void fail(const std::string& what);
    double elapsed() const;

    const Options options_;
    const volatile int& interrupted_;
    const TemporaryFolder folder_;
    const vantelhost::PlugIn plugIn_;
    SoakHost host_;
    const Clock::time_point begin_ = Clock::now();

    double nextSample_ = 0;
    double nextProgress_ = 60;
    const double warmUp_;
    Trend resident_;
    Trend descriptors_;

    // Between sessions.
    Holdings quietAtStart_;
    Holdings quiet_;

    std::uint64_t sessions_ = 0;
    std::map<std::string, std::uint64_t> faults_;
    std::map<std::string, Stops> endings_;
    std::string failure_;
};
