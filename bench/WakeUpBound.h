/// @file
#pragma once

#include <cstdint>
#include <vector>

/// What happened to the measurements of a daemon.
struct Delays {
    std::vector<double> seconds; ///< from a measurement to its pair
    double pairsPerSync = 0;
};

/// What the plug-in's choice of its sleeps allows at best: with polls that take a microsecond, a
/// system that wakes it on time, and Syncs that come exactly on time.
/// @param interval between two Syncs, in nanoseconds.
Delays bestDelays(std::uint64_t interval);
