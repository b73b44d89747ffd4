/// @file
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

namespace vantelhost {

/// An offset at its place on an even grid of time.
struct PhaseSample {
    std::int64_t slot = 0;
    double phase = 0;    ///< nanoseconds from the grid's base
    bool begins = false; ///< it is not to be compared with those before
};

/// Puts offsets onto a grid. Its interval is the mean of the distances between neighbours that
/// nothing is missing between: those that round to one median distance, that of the first
/// thousands. A longer distance leaves as many slots empty as it rounds to.
class PhaseGrid {
public:
    /// @param take gets the samples, some of them late; their slots ascend.
    explicit PhaseGrid(std::function<void(const PhaseSample&)> take);

    /// @param time   nanoseconds modulo 2^64
    /// @param offset nanoseconds
    void add(std::uint64_t time, std::int64_t offset);

    /// The next offset is the first of another clock, or came after nobody knows how long.
    void interrupt();

    /// There are no more for now: those that are kept are given.
    void flush();

    /// Of the grid, in seconds; 0 before two times that differ.
    double interval() const;

    /// About that, in seconds: the median distance. Known when samples are given.
    double median() const { return median_ * 1e-9; }

    /// The offset that phases are counted from, nanoseconds.
    std::int64_t base() const { return static_cast<std::int64_t>(base_); }

    /// Slots without a sample, between the first and the last one.
    std::int64_t missing() const { return missing_; }

private:
    struct Offset {
        std::uint64_t time;
        std::int64_t offset;
        bool begins;
    };

    void place(const Offset& offset);

    std::function<void(const PhaseSample&)> take_;
    std::vector<Offset> early_; ///< before the median is known
    bool begins_ = true;
    double median_ = 0; ///< nanoseconds; 0: not known
    Offset last_{0, 0, true};
    std::uint64_t base_ = 0; ///< the first offset
    std::int64_t slot_ = -1;
    std::int64_t missing_ = 0;
    double sum_ = 0; ///< of the single distances, nanoseconds
    double singles_ = 0;
};

} // namespace vantelhost
