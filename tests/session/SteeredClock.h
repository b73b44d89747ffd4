/// @file
#pragma once

#include <chrono>
#include <cstdint>
#include <string>

#include "simptp4l/SteeredTime.h"

/// A local clock and a grandmaster's, in a time that goes on as a test says: the simulated daemon
/// measures the one against the other.
class SteeredClock {
public:
    using nanoseconds = std::chrono::nanoseconds;

    /// @param path   the file that the daemon maps; made here
    /// @param phase  by how much the local clock is ahead
    /// @param excess by how much it runs faster while nobody steers it, ppb
    SteeredClock(const std::string& path, nanoseconds phase, double excess);
    ~SteeredClock();
    SteeredClock(const SteeredClock&) = delete;
    SteeredClock& operator=(const SteeredClock&) = delete;

    void pass(nanoseconds time);

    /// From now on it runs so much faster than it would by itself, ppb.
    void steer(double frequency);

    /// From now on the grandmaster's clock shows so much more.
    void moveGrandmaster(nanoseconds by);

    /// What the local clock shows, since 1970.
    nanoseconds local() const;

    /// By how much it is ahead of the grandmaster's.
    nanoseconds error() const;

    /// The time that has passed.
    nanoseconds passed() const;

private:
    simptp4l::SteeredTime* time_;
    const double excess_;
};
