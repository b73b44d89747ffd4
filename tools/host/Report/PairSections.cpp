#include "Report/PairSections.h"

#include <algorithm>
#include <iterator>

#include <fmt/format.h>

#include "Report/AllanDeviation.h"
#include "Report/Decimation.h"
#include "Report/Figure.h"
#include "Report/Html.h"
#include "Report/Statistics.h"
#include "Report/Units.h"
#include "Tally.h"

namespace vantelhost {

namespace {

constexpr std::size_t bins = 1500; ///< of time, two points each

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

std::string series(const Caption& caption, const std::vector<Point>& points, double duration,
                   double interval) {
    const double gap = std::max(5 * interval, 3 * duration / static_cast<double>(bins));
    const std::string note =
        points.size() <= 2 * bins
            ? ""
            : paragraph(fmt::format("Drawn are the lowest and the highest value of each of {} "
                                    "equal stretches of time.",
                                    bins));
    return seriesFigure(caption, decimate(points, bins), duration, gap) + note;
}

/// Figures of values that ascend, in nanoseconds.
std::string figures(const std::vector<std::int64_t>& sorted) {
    OffsetStatistics statistics;
    for (const auto value : sorted) {
        statistics.add(value);
    }
    const auto at = [&](unsigned perMille) {
        return shownTime(static_cast<double>(percentile(sorted, perMille)));
    };
    return table({"min", "1 %", "5 %", "median", "95 %", "99 %", "max", "mean", "rms"},
                 {{at(0), at(10), at(50), at(500), at(950), at(990), at(1000),
                   shownTime(statistics.mean()), shownTime(statistics.rms())}});
}

std::string histogramSection(const std::vector<std::int64_t>& offsets) {
    const auto bars = histogram(offsets, 60);
    std::string text = fmt::format("Each bar is {} wide.", shownTime(bars.width));
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
    for (std::size_t i = 0; i < intervals.size(); ++i) {
        points.push_back({recording.pairs[i + 1].seconds, static_cast<double>(intervals[i])});
    }
    std::sort(intervals.begin(), intervals.end());
    return section("Pair intervals",
                   paragraph("From the ingress of a pair's Sync to that of the next pair's.") +
                       series({"interval", "Intervals of pairs over time"}, points,
                              recording.duration, phase.interval) +
                       figures(intervals));
}

} // namespace

std::string pairSections(const Recording& recording) {
    const auto& pairs = recording.pairs;
    const auto phase = phaseOf(pairs);
    const auto offsets = sortedValues(pairs, offsetOf);
    std::string html =
        section("Offset", paragraph("Local minus reference time, at the time of the call.") +
                              series({"offset", "Offset over time"}, pointsOf(pairs, offsetOf),
                                     recording.duration, phase.interval) +
                              figures(offsets));
    html += histogramSection(offsets);
    html += deviationSection(phase);
    html += intervalSection(recording, phase);
    html += section(
        "Poll delay",
        paragraph("From the ingress of the Sync to the call, in the host's clock (CLOCK_REALTIME). "
                  "If ptp4l stamps with another clock, what is between the two is in it.") +
            series({"delay", "Poll delay over time"}, pointsOf(pairs, delayOf), recording.duration,
                   phase.interval) +
            figures(sortedValues(pairs, delayOf)));
    return html;
}

} // namespace vantelhost
