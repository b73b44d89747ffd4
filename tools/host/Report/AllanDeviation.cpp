#include "Report/AllanDeviation.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

/// From each time to the next one. Times are modulo 2^64.
std::vector<std::int64_t> distancesOf(const std::vector<std::uint64_t>& times) {
    std::vector<std::int64_t> distances;
    for (std::size_t i = 1; i < times.size(); ++i) {
        distances.push_back(static_cast<std::int64_t>(times[i] - times[i - 1]));
    }
    return distances;
}

double medianOf(std::vector<std::int64_t> values) {
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return static_cast<double>(*middle);
}

/// At least 1, also where the clock was set back; not so many that slots overflow.
std::int64_t stepsOf(std::int64_t distance, double interval) {
    constexpr double most = 1e9;
    const double steps = std::round(static_cast<double>(distance) / interval);
    return static_cast<std::int64_t>(std::clamp(steps, 1.0, most));
}

double meanOfSingleSteps(const std::vector<std::int64_t>& distances, double median) {
    double sum = 0;
    double count = 0;
    for (const auto distance : distances) {
        if (std::round(static_cast<double>(distance) / median) == 1) {
            sum += static_cast<double>(distance);
            ++count;
        }
    }
    return sum / count;
}

/// Moves on to the first sample that is not before the slot.
/// @return whether it is there.
bool advance(std::vector<PhaseSample>::const_iterator& sample,
             const std::vector<PhaseSample>& samples, std::int64_t slot) {
    while (sample != samples.end() && sample->slot < slot) {
        ++sample;
    }
    return sample != samples.end() && sample->slot == slot;
}

Deviation deviation(const PhaseSeries& series, std::int64_t steps) {
    const double tau = series.interval * static_cast<double>(steps);
    auto middle = series.samples.begin();
    auto last = series.samples.begin();
    double squares = 0;
    std::size_t terms = 0;
    for (const auto& first : series.samples) {
        const bool hasMiddle = advance(middle, series.samples, first.slot + steps);
        const bool hasLast = advance(last, series.samples, first.slot + 2 * steps);
        if (hasMiddle && hasLast) {
            const double difference = (last->phase - 2 * middle->phase + first.phase) * 1e-9;
            squares += difference * difference;
            ++terms;
        }
    }
    const double variance = terms == 0 ? 0 : squares / (2 * tau * tau * static_cast<double>(terms));
    return {tau, std::sqrt(variance), terms};
}

} // namespace

PhaseSeries onGrid(const std::vector<std::uint64_t>& times,
                   const std::vector<std::int64_t>& offsets) {
    PhaseSeries series;
    const auto distances = distancesOf(times);
    const double median = distances.empty() ? 0 : medianOf(distances);
    if (median <= 0) {
        return series;
    }
    const double interval = meanOfSingleSteps(distances, median);
    series.interval = interval * 1e-9;
    series.samples.push_back({0, 0});
    for (std::size_t i = 0; i < distances.size(); ++i) {
        const auto steps = stepsOf(distances[i], interval);
        series.missing += steps - 1;
        // Differences are small: a double holds them in full.
        const auto difference =
            static_cast<std::uint64_t>(offsets[i + 1]) - static_cast<std::uint64_t>(offsets[0]);
        series.samples.push_back({series.samples.back().slot + steps,
                                  static_cast<double>(static_cast<std::int64_t>(difference))});
    }
    return series;
}

std::vector<Deviation> allanDeviations(const PhaseSeries& series) {
    std::vector<Deviation> deviations;
    if (series.samples.empty()) {
        return deviations;
    }
    const std::int64_t length = series.samples.back().slot + 1;
    for (std::int64_t steps = 1; steps <= length / 4; steps *= 2) {
        const auto each = deviation(series, steps);
        if (each.terms > 0) {
            deviations.push_back(each);
        }
    }
    return deviations;
}

} // namespace vantelhost
