/// @file
#pragma once

#include <ctime>

/// What a clock shows, in seconds.
inline double secondsOf(clockid_t clock) {
    timespec time{};
    clock_gettime(clock, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}
