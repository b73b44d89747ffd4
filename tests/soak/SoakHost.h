/// @file
#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>
#include <mutex>
#include <string>

#include <vantel_bc/zekel.h>

#include "SessionPlan.h"

/// The host's four functions, and the system log: counts and keeps nothing, so that what grows is
/// the plug-in. Misbehaves when told to. One at a time.
class SoakHost {
public:
    using Clock = std::chrono::steady_clock;

    struct Counts {
        std::uint64_t polls = 0;  ///< that succeeded
        std::uint64_t failed = 0; ///< that did not
        std::uint64_t pairs = 0;
        std::uint64_t usable = 0; ///< reports of a usable quality
        std::uint64_t deaths = 0; ///< reports of a daemon that died
        std::uint64_t metaData = 0;
        std::uint64_t misdeeds = 0; ///< of this host
        std::uint64_t logLines = 0;
        std::uint64_t logErrors = 0;
    };

    SoakHost();
    ~SoakHost();
    SoakHost(const SoakHost&) = delete;
    SoakHost& operator=(const SoakHost&) = delete;

    /// From here on calls are expected, with this slot. Null: no more.
    void expect(void** slot);

    void misbehave(HostFault fault) { fault_ = fault; }

    Counts counts() const;

    /// Whether the last quality was usable.
    bool isUsable() const { return usable_; }

    /// When a poll ended last, well or not.
    Clock::time_point lastPoll() const { return lastPoll_; }

    /// The first call that broke the rules of the interface; empty when there was none.
    std::string violation() const;

    /// For the functions themselves.
    void getTime(void** context, std::uint64_t* time, zeerr_Status& status);
    void adjustTime(void** context, zeerr_Status& status);
    void setQuality(void** context, const double* quality, const char* reason,
                    zeerr_Status& status);
    void updateMetaData(void** context, const char* json, zeerr_Status& status);
    void logged(int priority);

private:
    void enter(void** context, const zeerr_Status& status);
    void answer(zeerr_Status& status);
    void violated(const char* rule);
    void polled() { lastPoll_ = Clock::now(); }
    unsigned random() { return (random_.fetch_add(0x9E3779B9U) * 2654435761U) >> 16; }

    std::atomic<void**> slot_{nullptr};
    std::atomic<HostFault> fault_{HostFault::none};
    std::atomic<unsigned> random_{1};
    std::atomic<bool> usable_{false};
    std::atomic<Clock::time_point> lastPoll_;
    mutable std::mutex mutex_;
    Counts counts_;
    std::string violation_;
};
