#include "OffsetLevel.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

double distance(double one, double other) {
    return std::abs(one - other);
}

/// Leaves room for what a clock drifts and a measurement is off.
bool isOneSecond(double nanoseconds) {
    constexpr double second = 1e9;
    constexpr double tolerance = 50e6;
    return distance(nanoseconds, second) <= tolerance;
}

} // namespace

bool OffsetLevel::take(double seconds, std::int64_t offset) {
    const Point now{seconds, static_cast<double>(offset)};
    const bool isDistrusted = distrusted_ > 0;
    distrusted_ -= isDistrusted ? 1U : 0U;
    if (isDistrusted || !goesOn(now)) {
        const bool confirmed = isConfirmed(now);
        candidate_ = now;
        if (isDistrusted || !confirmed) {
            return false;
        }
    }
    believed_ = now;
    candidate_.reset();
    strays_ = 0;
    return true;
}

bool OffsetLevel::goesOn(const Point& now) {
    if (!believed_) {
        return true;
    }
    const bool isNear = areNear(*believed_, now);
    if (isNear) {
        spread_ += (distance(now.offset, believed_->offset) - spread_) / 8;
    }
    return isNear;
}

bool OffsetLevel::areNear(const Point& before, const Point& now) const {
    constexpr double always = 1e6;
    constexpr double slewed = 100e6; // in a second: what chronyd does at most, and the kernel can
    const double passed = std::clamp(now.seconds - before.seconds, 0.0, 1.0);
    return distance(before.offset, now.offset) <= always + 100 * spread_ + slewed * passed;
}

bool OffsetLevel::isConfirmed(const Point& now) {
    constexpr unsigned mostStrays = 8;
    if (candidate_ && areNear(*candidate_, now)) {
        strays_ = 0;
        return !isLeap_ || now.seconds - begin_ >= leapPatience;
    }
    begin_ = now.seconds;
    isLeap_ = believed_ && isOneSecond(distance(now.offset, believed_->offset));
    if (++strays_ < mostStrays) {
        return false;
    }
    // None is near another: offsets are spread more widely than before.
    spread_ = distance(now.offset, candidate_->offset);
    return true;
}

} // namespace vantelhost
