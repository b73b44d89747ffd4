/// @file
#pragma once

#include <cstdint>
#include <optional>

namespace vantelhost {

/// Tells offsets that go on from where they were from those that jump: a clock was stepped, a
/// grandmaster's time was, or ptp4l has measured across a step, which gives one offset that is far
/// off. An offset that has jumped is not believed until the next one confirms it. Two offsets are
/// near each other up to 1 ms and a hundred times what usually is between two, and a clock that is
/// slewed may move on by 100 ms/s.
///
/// A jump of a second may be a leap second, which has come to one of two clocks only: it is
/// believed when it has lasted for leapPatience.
///
/// Knows nothing of threads.
class OffsetLevel {
public:
    /// In seconds. A grandmaster's word of a leap second comes up to two Announce intervals late,
    /// and one interval later from each boundary clock before this one.
    static constexpr double leapPatience = 30;

    /// The clock was stepped: the next two are not believed. The first may be of before, and the
    /// second measured across the step.
    void distrust() { distrusted_ = 2; }

    /// @param seconds when, in the clock whose offset it is; a step of that does not matter
    /// @param offset  nanoseconds
    /// @return whether it is believed.
    bool take(double seconds, std::int64_t offset);

private:
    struct Point {
        double seconds;
        double offset; ///< nanoseconds
    };

    bool areNear(const Point& before, const Point& now) const;

    /// Whether it goes on from what was believed, or is the first.
    bool goesOn(const Point& now);

    /// Whether it shows that the one before has begun another level.
    bool isConfirmed(const Point& now);

    std::optional<Point> believed_;  ///< the last one
    std::optional<Point> candidate_; ///< the last one, if it was not believed
    double begin_ = 0;               ///< of the level that the candidate belongs to, seconds
    bool isLeap_ = false;            ///< that level is a second off the believed one
    double spread_ = 0;              ///< what usually is between two, nanoseconds
    unsigned distrusted_ = 0;
    unsigned strays_ = 0; ///< how many in a row were near no other one
};

} // namespace vantelhost
