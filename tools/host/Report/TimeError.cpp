#include "Report/TimeError.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace vantelhost {

namespace {

/// @param time seconds
std::int64_t slotsIn(double time, double interval) {
    constexpr double most = 1e12;
    return static_cast<std::int64_t>(std::min(std::round(time / interval), most));
}

std::optional<double> rangeOf(const std::optional<Extent>& extent) {
    return extent ? std::optional(extent->high - extent->low) : std::nullopt;
}

} // namespace

void TimeError::Stability::add(const PhaseSample& sample) {
    mtie.add(sample);
    tdev.add(sample);
}

Wander TimeError::Stability::wander(double interval) const {
    return {mtie.values(interval), tdev.values(interval)};
}

TimeError::Parts::Parts(double interval)
    : averages(std::max<std::int64_t>(slotsIn(constantTime, interval), 1)),
      filter(dynamicCutoff, interval),
      whole{Mtie(slotsIn(constantTime, interval)), {}},
      low{whole} {}

void TimeError::add(const PhaseSample& sample, double interval) {
    if (!parts_) {
        parts_.emplace(interval);
    }
    auto next = sample;
    next.begins = sample.begins || sample.slot - lastSlot_ > longestGap;
    lastSlot_ = sample.slot;
    lowBegins_ = lowBegins_ || next.begins;
    parts_->averages.add(next);
    parts_->whole.add(next);
    if (const auto phase = parts_->filter.next(next)) {
        addFiltered(next, *phase);
    }
}

void TimeError::addFiltered(const PhaseSample& sample, double phase) {
    parts_->low.add({sample.slot, phase, std::exchange(lowBegins_, false)});
    low_ = joined(low_, phase);
    high_ = joined(high_, sample.phase - phase);
}

std::optional<Extent> TimeError::averages() const {
    return parts_ ? parts_->averages.extent() : std::nullopt;
}

std::optional<double> TimeError::lowPassRange() const {
    return rangeOf(low_);
}

std::optional<double> TimeError::highPassRange() const {
    return rangeOf(high_);
}

Wander TimeError::wander(double interval) const {
    return parts_ ? parts_->whole.wander(interval) : Wander{};
}

Wander TimeError::lowPassWander(double interval) const {
    return parts_ ? parts_->low.wander(interval) : Wander{};
}

} // namespace vantelhost
