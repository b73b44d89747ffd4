#include "Report/RecordAxis.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

namespace vantelhost {

namespace {

/// A year of 366 days, a hundred times.
constexpr double longestRun = 3.2e9;

/// What the two clocks may differ by from one line to the next.
constexpr double tolerance = 1;

void refuseBeyond(const Moment& moment) {
    if (moment.seconds < 0 || moment.seconds > longestRun) {
        throw std::runtime_error("t is out of range");
    }
}

} // namespace

double RecordAxis::begin(const Moment& moment, bool fromStart) {
    refuseBeyond(moment);
    const double passed = last_ ? elapsed(moment) : 0;
    if (last_ || !fromStart) {
        base_ = seconds_ + std::clamp(passed, 0.0, longestRun) - moment.seconds;
    }
    last_ = moment;
    seconds_ = base_ + moment.seconds;
    return passed;
}

double RecordAxis::follow(const Moment& moment) {
    refuseBeyond(moment);
    if (moment.seconds < last_->seconds) {
        throw std::runtime_error("t goes back");
    }
    const double set = elapsed(moment) - (moment.seconds - last_->seconds);
    last_ = moment;
    seconds_ = base_ + moment.seconds;
    return std::abs(set) > tolerance ? set : 0;
}

bool RecordAxis::mayFollow(const Moment& moment) const {
    const double steady = last_ ? moment.seconds - last_->seconds : -1;
    return steady >= 0 && std::abs(elapsed(moment) - steady) <= tolerance;
}

std::uint64_t RecordAxis::origin() const {
    return last_ ? last_->realtime - static_cast<std::uint64_t>(seconds_ * 1e9) : 0;
}

/// In the host's clock, modulo 2^64 nanoseconds.
double RecordAxis::elapsed(const Moment& moment) const {
    return static_cast<double>(static_cast<std::int64_t>(moment.realtime - last_->realtime)) / 1e9;
}

} // namespace vantelhost
