#include "Report/AllanDeviation.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

/// Second differences that begin within an averaging time, at most: 2^10.
constexpr unsigned overlapOctaves = 10;

/// Up to 2^31 steps: eight years of eight offsets a second.
constexpr unsigned octaveCount = 32;

/// Two averaging times and the present sample fit in; a power of two is indexed fast.
constexpr std::size_t ringSize = std::size_t{4} << overlapOctaves;

constexpr std::int64_t nowhere = -1;

} // namespace

PhaseSample& AllanDeviation::Ring::at(std::int64_t slot) {
    return samples[static_cast<std::size_t>(slot >> zeros) % ringSize];
}

void AllanDeviation::Ring::clear() {
    samples.assign(ringSize, {nowhere, 0});
}

void AllanDeviation::Octave::add(Ring& ring, const PhaseSample& last) {
    const auto middleSlot = last.slot - steps;
    const auto firstSlot = middleSlot - steps;
    if (firstSlot < 0) {
        return;
    }
    const auto& middle = ring.at(middleSlot);
    const auto& first = ring.at(firstSlot);
    if (middle.slot == middleSlot && first.slot == firstSlot) {
        const double difference = last.phase - 2 * middle.phase + first.phase;
        squares += difference * difference;
        ++terms;
    }
}

AllanDeviation::AllanDeviation() {
    for (unsigned octave = 0; octave < octaveCount; ++octave) {
        octaves_.push_back({std::int64_t{1} << octave});
        if (octave >= overlapOctaves) {
            rings_.push_back({octave - overlapOctaves, {}});
            rings_.back().clear();
        }
    }
}

void AllanDeviation::add(const PhaseSample& sample) {
    if (sample.begins) {
        std::for_each(rings_.begin(), rings_.end(), [](Ring& ring) { ring.clear(); });
    }
    slots_ = sample.slot + 1;
    // The ring of all slots serves the octaves that overlap in full, each further ring one more.
    std::size_t octave = 0;
    for (std::size_t number = 0; number < rings_.size(); ++number) {
        auto& ring = rings_[number];
        if (!ring.takes(sample.slot)) {
            return;
        }
        ring.at(sample.slot) = sample;
        for (; octave <= number + overlapOctaves; ++octave) {
            octaves_[octave].add(ring, sample);
        }
    }
}

std::vector<TauValue> AllanDeviation::deviations(double interval) const {
    std::vector<TauValue> result;
    for (const auto& [steps, squares, terms] : octaves_) {
        if (steps <= slots_ / 4 && terms > 0) {
            const double tau = interval * static_cast<double>(steps);
            const double variance = squares / (2 * tau * tau * static_cast<double>(terms));
            result.push_back({tau, std::sqrt(variance) * 1e-9, terms});
        }
    }
    return result;
}

} // namespace vantelhost
