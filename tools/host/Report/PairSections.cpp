#include "Report/PairSections.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include <fmt/format.h>

#include "Report/AllanDeviation.h"
#include "Report/Figure.h"
#include "Report/Html.h"
#include "Report/SeriesFigure.h"
#include "Report/Statistics.h"
#include "Report/Units.h"
#include "Tally.h"

namespace vantelhost {

namespace {

/// One value for each pair, at the time of its call.
template <typename Value>
std::vector<Point> pointsOf(const std::vector<Pair>& pairs, Value value) {
    std::vector<Point> points;
    points.reserve(pairs.size());
    for (const auto& pair : pairs) {
        points.push_back({pair.seconds, static_cast<double>(value(pair))});
    }
    return points;
}

template <typename Value>
std::vector<std::int64_t> sortedValues(const std::vector<Pair>& pairs, Value value) {
    std::vector<std::int64_t> values;
    values.reserve(pairs.size());
    std::transform(pairs.begin(), pairs.end(), std::back_inserter(values), value);
    std::sort(values.begin(), values.end());
    return values;
}

std::int64_t offsetOf(const Pair& pair) {
    return pair.offset;
}

std::int64_t delayOf(const Pair& pair) {
    return pair.delay;
}

/// From each pair's ingress to the next one's.
std::vector<std::int64_t> intervalsOf(const std::vector<Pair>& pairs) {
    std::vector<std::int64_t> intervals;
    for (std::size_t i = 1; i < pairs.size(); ++i) {
        intervals.push_back(static_cast<std::int64_t>(pairs[i].ingress - pairs[i - 1].ingress));
    }
    return intervals;
}

PhaseSeries phaseOf(const std::vector<Pair>& pairs) {
    std::vector<std::uint64_t> times;
    std::vector<std::int64_t> offsets;
    times.reserve(pairs.size());
    offsets.reserve(pairs.size());
    for (const auto& pair : pairs) {
        times.push_back(pair.ingress);
        offsets.push_back(pair.offset);
    }
    return onGrid(times, offsets);
}

std::string pairsText(std::size_t count) {
    return fmt::format("{} pair{}", count, count == 1 ? "" : "s");
}

/// What an axis of this extent is counted from; empty if that is 0.
std::string baseText(const Extent& extent) {
    const double base = baseOf(extent);
    return base == 0 ? "" : fmt::format(" 0 on the axis stands for {:.0f} ns.", base);
}

/// What a reader of the drawing must know.
std::string howItIsDrawn(const std::vector<std::int64_t>& sorted, const Extent& range) {
    std::string text = "Shaded: the quality was not usable." + baseText(range);
    if (areBands(sorted.size())) {
        text += fmt::format(" For each of {} stretches of time: the median (line), 25 to 75 % of "
                            "the values (dark), 1 to 99 % (light), the lowest and the highest "
                            "(strokes).",
                            bandStretches);
    }
    const auto isBefore = [](std::int64_t value, double edge) {
        return static_cast<double>(value) < edge;
    };
    const auto isBeyond = [](double edge, std::int64_t value) {
        return edge < static_cast<double>(value);
    };
    const auto below = std::lower_bound(sorted.begin(), sorted.end(), range.low, isBefore);
    const auto above = std::upper_bound(sorted.begin(), sorted.end(), range.high, isBeyond);
    if (above != sorted.end()) {
        text += fmt::format(" Above the edge: {}, up to {}.", sorted.end() - above,
                            shownTime(static_cast<double>(sorted.back())));
    }
    if (below != sorted.begin()) {
        text += fmt::format(" Below the edge: {}, down to {}.", below - sorted.begin(),
                            shownTime(static_cast<double>(sorted.front())));
    }
    return paragraph(text);
}

/// Figures of values that ascend, in nanoseconds.
/// @param range where nearly all are
std::string figures(const std::vector<std::int64_t>& sorted, const Extent& range) {
    const bool isExact = baseOf(range) != 0;
    const auto shown = [&](double value) {
        return isExact ? fmt::format("{:.0f} ns", value) : shownTime(value);
    };
    OffsetStatistics statistics;
    for (const auto value : sorted) {
        statistics.add(value);
    }
    const auto at = [&](unsigned perMille) {
        return shown(static_cast<double>(percentile(sorted, perMille)));
    };
    return definitions({{"min", at(0)},
                        {"1 %", at(10)},
                        {"5 %", at(50)},
                        {"median", at(500)},
                        {"95 %", at(950)},
                        {"99 %", at(990)},
                        {"max", at(1000)},
                        {"mean", shown(statistics.mean())},
                        {"rms", shown(statistics.rms())}});
}

/// A drawing of values over time, and their figures.
/// @param sorted   the same values, ascending
/// @param interval about the time from one to the next, seconds
std::string series(const Caption& caption, std::vector<Point> points,
                   const std::vector<std::int64_t>& sorted, const Recording& recording,
                   double interval) {
    const auto range = bulk(sorted);
    const double gap = std::max(5 * interval, recording.duration / 500);
    return seriesFigure(caption, {std::move(points), range, gap}, TimeAxis(recording)) +
           howItIsDrawn(sorted, range) + figures(sorted, range);
}

/// What the figures below are not made of; empty if that is nothing.
std::string leftOut(const PairCounts& counts) {
    std::string html;
    if (counts.of1970 > 0) {
        html += paragraph(fmt::format("Left out: {} of 1970. A grandmaster went, no Sync is behind "
                                      "it.",
                                      pairsText(counts.of1970)));
    }
    if (counts.measured > 0 && counts.falseOffsets > 0) {
        html += paragraph(fmt::format("Left out: {} with a false offset. A grandmaster came, and "
                                      "no delay was measured yet.",
                                      pairsText(counts.falseOffsets)));
    }
    return html;
}

std::string histogramSection(const std::vector<std::int64_t>& offsets) {
    const auto bars = histogram(offsets, 60);
    const double end = bars.low + bars.width * static_cast<double>(bars.counts.size());
    std::string text =
        fmt::format("Each bar is {} wide.", shownTime(bars.width)) + baseText({bars.low, end});
    if (bars.below + bars.above > 0) {
        text += fmt::format(" Further away: {} pairs to the left, {} to the right.", bars.below,
                            bars.above);
    }
    return section("Distribution of the offset",
                   histogramFigure({"histogram", "Histogram of the offset"}, bars) +
                       paragraph(text));
}

std::string howItIsMade(const PhaseSeries& series) {
    return paragraph(fmt::format(
        "Overlapping Allan deviation of the offset as time error. The offsets stand on a grid of "
        "{}, the mean distance of successive pairs. Places of the grid without an offset, from "
        "missed Syncs and gaps: {}. Nothing is interpolated: sums that need one of those are "
        "left out.",
        shownTime(series.interval * 1e9), series.missing));
}

std::string deviationSection(const PhaseSeries& series) {
    const auto deviations = allanDeviations(series);
    const bool visible = std::any_of(deviations.begin(), deviations.end(),
                                     [](const Deviation& each) { return each.value > 0; });
    std::string html;
    if (visible) {
        html =
            deviationFigure({"deviation", "Allan deviation over the averaging time"}, deviations);
    }
    if (deviations.empty()) {
        html += paragraph("Too few pairs.");
    } else {
        std::vector<Row> rows;
        rows.reserve(deviations.size());
        for (const auto& each : deviations) {
            rows.push_back({fmt::format("{:.5g} s", each.tau), fmt::format("{:.3e}", each.value),
                            fmt::format("{}", each.terms)});
        }
        html += howItIsMade(series) + table({"tau", "deviation", "sums"}, rows);
    }
    return section("Allan deviation", html);
}

std::string intervalSection(const Recording& recording, const PhaseSeries& phase) {
    auto intervals = intervalsOf(recording.pairs);
    if (intervals.empty()) {
        return section("Pair intervals", paragraph("There is one pair only."));
    }
    std::vector<Point> points;
    points.reserve(intervals.size());
    for (std::size_t i = 0; i < intervals.size(); ++i) {
        points.push_back({recording.pairs[i + 1].seconds, static_cast<double>(intervals[i])});
    }
    std::sort(intervals.begin(), intervals.end());
    return section("Pair intervals",
                   paragraph("From the ingress of a pair's Sync to that of the next pair's.") +
                       series({"interval", "Intervals of pairs over time"}, std::move(points),
                              intervals, recording, phase.interval));
}

std::string delaySection(const Recording& recording, const PhaseSeries& phase) {
    return section(
        "Poll delay",
        paragraph("From the ingress of the Sync to the call, in the host's clock (CLOCK_REALTIME). "
                  "If ptp4l stamps with another clock, what is between the two is in it.") +
            series({"delay", "Poll delay over time"}, pointsOf(recording.pairs, delayOf),
                   sortedValues(recording.pairs, delayOf), recording, phase.interval));
}

std::string offsetSections(const Recording& recording, const PhaseSeries& phase) {
    const auto offsets = sortedValues(recording.pairs, offsetOf);
    return section("Offset",
                   paragraph("Local minus reference time, at the time of the call.") +
                       leftOut(recording.counts) +
                       series({"offset", "Offset over time"}, pointsOf(recording.pairs, offsetOf),
                              offsets, recording, phase.interval)) +
           histogramSection(offsets) + deviationSection(phase);
}

} // namespace

std::string pairSections(const Recording& recording) {
    const auto phase = phaseOf(recording.pairs);
    const auto& counts = recording.counts;
    return (counts.onlyZeros()
                ? section("Offset", paragraph("No offset is a measurement.") + leftOut(counts))
                : offsetSections(recording, phase)) +
           intervalSection(recording, phase) + delaySection(recording, phase);
}

} // namespace vantelhost
