#include "Report/PhaseGrid.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace vantelhost {

namespace {

/// So many tell the median distance.
constexpr std::size_t enough = 4096;

double medianOf(std::vector<std::int64_t> values) {
    if (values.empty()) {
        return 0;
    }
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return static_cast<double>(*middle);
}

double distance(std::uint64_t from, std::uint64_t to) {
    return static_cast<double>(static_cast<std::int64_t>(to - from));
}

/// At least 1, also where the clock was set back; not so many that slots overflow.
std::int64_t stepsOf(double distance, double interval) {
    constexpr double most = 1e9;
    return static_cast<std::int64_t>(std::clamp(std::round(distance / interval), 1.0, most));
}

} // namespace

PhaseGrid::PhaseGrid(std::function<void(const PhaseSample&)> take) : take_(std::move(take)) {}

void PhaseGrid::add(std::uint64_t time, std::int64_t offset) {
    const Offset next{time, offset, std::exchange(begins_, false)};
    if (median_ > 0) {
        place(next);
        return;
    }
    early_.push_back(next);
    if (early_.size() >= enough) {
        flush();
    }
}

void PhaseGrid::interrupt() {
    begins_ = true;
}

void PhaseGrid::flush() {
    std::vector<std::int64_t> distances;
    for (std::size_t i = 1; i < early_.size(); ++i) {
        if (!early_[i].begins) {
            distances.push_back(static_cast<std::int64_t>(early_[i].time - early_[i - 1].time));
        }
    }
    median_ = std::max(medianOf(std::move(distances)), 0.0);
    const auto early = std::exchange(early_, {});
    if (median_ > 0) {
        std::for_each(early.begin(), early.end(), [this](const Offset& each) { place(each); });
    }
}

double PhaseGrid::interval() const {
    return singles_ == 0 ? 0 : sum_ / singles_ * 1e-9;
}

void PhaseGrid::place(const Offset& offset) {
    if (slot_ < 0) {
        base_ = static_cast<std::uint64_t>(offset.offset);
    }
    std::int64_t steps = 1;
    if (!offset.begins) {
        const double length = distance(last_.time, offset.time);
        steps = stepsOf(length, median_);
        missing_ += steps - 1;
        if (std::round(length / median_) == 1) {
            sum_ += length;
            ++singles_;
        }
    }
    slot_ += steps;
    last_ = offset;
    // Differences are small: a double holds them in full.
    const auto phase = static_cast<std::uint64_t>(offset.offset) - base_;
    take_({slot_, static_cast<double>(static_cast<std::int64_t>(phase)), offset.begins});
}

} // namespace vantelhost
