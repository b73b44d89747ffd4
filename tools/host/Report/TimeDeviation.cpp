#include "Report/TimeDeviation.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

/// Means that begin within an averaging time, at most: 2^10.
constexpr unsigned tdevOverlap = 10;

} // namespace

void TimeDeviation::Octave::take(const Windows::Window& window) {
    const auto* first = window.ago(2 * steps);
    if (first == nullptr) {
        return;
    }
    const auto* middle = window.ago(steps);
    const auto& last = window.part();
    if (std::min({first->count, middle->count, last.count}) * 2 < static_cast<double>(steps)) {
        return;
    }
    const double difference = last.mean() - 2 * middle->mean() + first->mean();
    squares += difference * difference;
    ++terms;
}

TimeDeviation::TimeDeviation() : windows_(tdevOverlap, 2) {
    for (unsigned octave = 0; octave < Windows::lengths; ++octave) {
        octaves_.push_back({std::int64_t{1} << octave});
    }
}

void TimeDeviation::add(const PhaseSample& sample) {
    if (sample.begins) {
        windows_.begin();
        nextSlot_ = sample.slot;
    }
    for (; nextSlot_ < sample.slot; ++nextSlot_) {
        addPlace({});
    }
    addPlace({sample.phase, 1});
    ++nextSlot_;
}

void TimeDeviation::addPlace(const Sum& place) {
    windows_.add(place,
                 [this](const Windows::Window& window) { octaves_[window.octave()].take(window); });
}

std::vector<TauValue> TimeDeviation::values(double interval) const {
    std::vector<TauValue> result;
    for (const auto& [steps, squares, terms] : octaves_) {
        if (terms > 0) {
            const double mean = squares / static_cast<double>(terms);
            result.push_back({interval * static_cast<double>(steps), std::sqrt(mean / 6), terms});
        }
    }
    return result;
}

} // namespace vantelhost
