/// @file
/// The system's clock as a test sets it. Stands in this program in place of clock_gettime(2), also
/// for the code under test, which must be linked and not loaded.
#pragma once

#include <cstdint>

/// Stops CLOCK_REALTIME at a time in nanoseconds while this object lives. Other clocks go on.
class StoppedRealtime {
public:
    explicit StoppedRealtime(std::int64_t nanoseconds);
    ~StoppedRealtime();
    StoppedRealtime(const StoppedRealtime&) = delete;
    StoppedRealtime& operator=(const StoppedRealtime&) = delete;
};
