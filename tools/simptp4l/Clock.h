/// @file
/// The simulated grandmaster and the time measured against it.
#pragma once

#include "Script.h"
#include "SteeredTime.h"

#include <cstdint>
#include <optional>

namespace simptp4l {

/// What TIME_STATUS_NP shows of the clock.
struct ClockReading {
    bool gmPresent = false;
    bool gmSeen = false; ///< there is or has been a grandmaster
    std::int64_t masterOffset = 0;
    std::int64_t ingressTime = 0;
};

/// Sync messages arrive at fixed intervals from the moment the grandmaster appears. The first of
/// them come before a path delay is known: as in ptp4l they set the ingress time, and the offset
/// stays. `now` is nanoseconds since the start of the process and must not go back; where the time
/// is steered, that of the steered file counts instead.
class Clock {
public:
    /// @param start CLOCK_MONOTONIC at the start of the process
    /// Throws std::system_error when the steered file cannot be mapped.
    Clock(const Script& script, int logSyncInterval, std::int64_t start);

    /// The state after the last Sync that has arrived by `now`. Repeated calls between two Syncs
    /// give the same values.
    ClockReading read(std::int64_t now);

    /// When it goes, the offset stays as it was and the ingress time becomes 0, as in ptp4l.
    void setGrandmaster(bool present, std::int64_t now);

    /// Steps the local clock: the last measurement moves with it at once.
    void step(std::int64_t difference);

private:
    /// Nanoseconds since the start, of the time that counts.
    std::int64_t elapsed(std::int64_t now) const;
    void measure(std::int64_t arrival, std::uint64_t index);
    std::int64_t ingressOf(std::int64_t arrival) const;
    std::int64_t steeredOffset(std::int64_t arrival) const;
    std::int64_t jitter(std::uint64_t index) const;

    const Script& script_;
    std::optional<SteeredTimeFile> steered_;
    std::int64_t start_;
    std::int64_t interval_;
    bool present_;
    bool seen_ = false;
    std::int64_t since_; ///< when the grandmaster appeared or will appear
    std::int64_t last_ = -1;
    std::int64_t offset_ = 0;
    std::int64_t ingress_ = 0;
    std::int64_t stepped_ = 0;
};

} // namespace simptp4l
