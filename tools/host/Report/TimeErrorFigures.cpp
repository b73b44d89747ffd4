#include "Report/TimeErrorFigures.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

/// Means above the grid's base, above 0.
std::optional<Extent> fromBase(const std::optional<Extent>& means, std::int64_t base) {
    const auto start = static_cast<double>(base);
    return means ? std::optional(Extent{means->low + start, means->high + start}) : std::nullopt;
}

} // namespace

double TimeErrorFigures::largest() const {
    return std::max(std::abs(extent.low), std::abs(extent.high));
}

double TimeErrorFigures::constantError() const {
    if (!constant) {
        return mean;
    }
    return std::abs(constant->low) > std::abs(constant->high) ? constant->low : constant->high;
}

TimeErrorFigures figuresOf(const PairSeries& pairs) {
    const auto& offsets = pairs.offsets().statistics();
    const auto& error = pairs.timeError();
    TimeErrorFigures figures;
    figures.interval = pairs.grid().interval();
    figures.missing = pairs.grid().missing();
    figures.seconds = figures.interval * static_cast<double>(offsets.count);
    figures.extent = {static_cast<double>(offsets.smallest), static_cast<double>(offsets.largest)};
    figures.mean = offsets.mean();
    figures.rms = offsets.rms();
    figures.averages = error.averageCount();
    figures.constant = fromBase(error.averages(), pairs.grid().base());
    figures.lowPassRange = error.lowPassRange();
    figures.highPassRange = error.highPassRange();
    figures.whole = error.wander(figures.interval);
    figures.low = error.lowPassWander(figures.interval);
    figures.deviations = pairs.deviations();
    return figures;
}

} // namespace vantelhost
