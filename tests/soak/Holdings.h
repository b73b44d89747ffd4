/// @file
#pragma once

#include <cstdint>

/// What this process holds.
struct Holdings {
    long resident = 0; ///< KiB: VmRSS
    int descriptors = 0;
    int threads = 0;

    static Holdings now();
};

/// What of one quantity is left of many samples, in constant memory.
class Trend {
public:
    /// Averages at start and end are of so many samples.
    explicit Trend(unsigned window) : window_(window) {}

    void add(double seconds, double value);

    double start() const;
    double end() const;
    double peak() const { return peak_; }
    double growth() const { return end() - start(); }

    /// Of the line that fits best.
    double perHour() const;

private:
    static constexpr unsigned longestWindow = 60;

    unsigned window_;
    unsigned count_ = 0;
    double first_ = 0;
    double last_[longestWindow] = {};
    double peak_ = 0;
    double seconds_ = 0;
    double values_ = 0;
    double secondsSquared_ = 0;
    double products_ = 0;
};
