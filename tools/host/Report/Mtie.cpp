#include "Report/Mtie.h"

namespace vantelhost {

namespace {

/// More than ten thousand seconds of eight offsets a second are looked at in full.
constexpr unsigned mtieOverlap = 17;

/// Of the longest window that has no more places: it and an earlier one make up the whole.
unsigned octaveOf(std::int64_t places) {
    unsigned octave = 0;
    while (std::int64_t{2} << octave <= places) {
        ++octave;
    }
    return octave;
}

} // namespace

void Mtie::Span::take(const Windows::Window& window, std::int64_t places) {
    auto all = window.part();
    if (places > 0) {
        const auto* before = window.ago(places);
        if (before == nullptr) {
            return;
        }
        all.add(*before);
    }
    if (all.low <= all.high) {
        largest = std::max(largest, all.high - all.low);
        ++windows;
    }
}

Mtie::Mtie(std::int64_t extra) : windows_(mtieOverlap, 1), extraOctave_(octaveOf(extra + 1)) {
    for (unsigned octave = 0; octave < Windows::lengths; ++octave) {
        octaves_.push_back({std::int64_t{1} << octave});
    }
    const bool isOctave = extra == std::int64_t{1} << octaveOf(extra);
    extra_.steps = isOctave || extra > std::int64_t{1} << mtieOverlap ? 0 : extra;
}

void Mtie::add(const PhaseSample& sample) {
    if (sample.begins) {
        windows_.begin();
        nextSlot_ = sample.slot;
    }
    for (; nextSlot_ < sample.slot; ++nextSlot_) {
        addPlace({});
    }
    addPlace({sample.phase, sample.phase});
    ++nextSlot_;
}

void Mtie::addPlace(const Extremes& place) {
    windows_.add(place, [this](const Windows::Window& window) {
        // A place more than intervals; where windows are further apart that is next to nothing.
        octaves_[window.octave()].take(window, window.isEverywhere() ? 1 : 0);
        if (extra_.steps > 0 && window.octave() == extraOctave_) {
            extra_.take(window, extra_.steps + 1 - window.length());
        }
    });
}

std::vector<TauValue> Mtie::values(double interval) const {
    auto spans = octaves_;
    spans.push_back(extra_);
    std::sort(spans.begin(), spans.end(),
              [](const Span& one, const Span& other) { return one.steps < other.steps; });
    std::vector<TauValue> result;
    for (const auto& [steps, largest, windows] : spans) {
        if (windows > 0) {
            result.push_back({interval * static_cast<double>(steps), largest, windows});
        }
    }
    return result;
}

} // namespace vantelhost
