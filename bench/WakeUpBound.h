/// @file
#pragma once

#include <cstdint>
#include <vector>

/// What happened to the measurements of a daemon.
struct Delays {
    std::vector<double> seconds; ///< from a measurement to its pair
    double pairsPerSync = 0;
};

/// What the plug-in's choice of its sleeps settles at when nothing disturbs it: with polls that
/// take a microsecond, a system that wakes it on time, and Syncs that come exactly on time.
/// @param interval between two Syncs, in seconds.
Delays bestDelays(double interval);
