#include "Report/PairSections.h"

#include <algorithm>

#include <fmt/format.h>

#include "Report/Figure.h"
#include "Report/Html.h"
#include "Report/SeriesFigure.h"
#include "Report/Statistics.h"
#include "Report/TimeErrorSections.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

std::string pairsText(std::size_t count) {
    return fmt::format("{} pair{}", count, count == 1 ? "" : "s");
}

/// What an axis of this extent is counted from; empty if that is 0.
std::string baseText(const Extent& extent) {
    const double base = baseOf(extent);
    return base == 0 ? "" : fmt::format(" 0 on the axis stands for {:.0f} ns.", base);
}

/// What a reader of the drawing must know.
std::string howItIsDrawn(const Series& series, const Extent& range) {
    std::string text = "Shaded: the quality was not usable." + baseText(range);
    if (!series.isWhole()) {
        text += fmt::format(" For each {} of time: the median (line), 25 to 75 % of the values "
                            "(dark), 1 to 99 % (light), the lowest and the highest (strokes).",
                            shownDuration(series.distribution().width()));
    }
    const auto& values = series.values();
    const auto [below, above] = outliers(values, range);
    if (above > 0) {
        text += fmt::format(" Above the edge: {}, up to {}.", above,
                            shownTime(static_cast<double>(values.largest())));
    }
    if (below > 0) {
        text += fmt::format(" Below the edge: {}, down to {}.", below,
                            shownTime(static_cast<double>(values.smallest())));
    }
    return paragraph(text);
}

/// Figures in nanoseconds.
/// @param range where nearly all values are
std::string figures(const Series& series, const Extent& range) {
    const bool isExact = baseOf(range) != 0;
    const auto shown = [&](double value) {
        return isExact ? fmt::format("{:.0f} ns", value) : shownTime(value);
    };
    const auto at = [&](unsigned perMille) {
        return shown(static_cast<double>(percentile(series.values(), perMille)));
    };
    return definitions({{"min", at(0)},
                        {"1 %", at(10)},
                        {"5 %", at(50)},
                        {"median", at(500)},
                        {"95 %", at(950)},
                        {"99 %", at(990)},
                        {"max", at(1000)},
                        {"mean", shown(series.statistics().mean())},
                        {"rms", shown(series.statistics().rms())}});
}

/// A drawing of values over time, and their figures.
std::string seriesPart(const Caption& caption, const Series& series, const Recording& recording) {
    const auto range = bulk(series.values());
    const double gap = std::max(5 * recording.pairs->grid().interval(), recording.duration / 500);
    return seriesFigure(caption, series, {range, gap}, TimeAxis(recording)) +
           howItIsDrawn(series, range) + figures(series, range);
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
    if (counts.distrusted > 0) {
        html += paragraph(fmt::format("Left out: {} that the host did not believe, behind a "
                                      "return or a jump, or all of the same offset.",
                                      pairsText(counts.distrusted)));
    }
    return html;
}

std::string histogramSection(const ValueCounts& offsets) {
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

std::string intervalSection(const Recording& recording) {
    const auto& intervals = recording.pairs->intervals();
    if (intervals.values().size() == 0) {
        return section("Pair intervals", paragraph("There is one pair only."));
    }
    return section(
        "Pair intervals",
        paragraph("From the ingress of a pair's Sync to that of the next pair's.") +
            seriesPart({"interval", "Intervals of pairs over time"}, intervals, recording));
}

std::string delaySection(const Recording& recording) {
    return section(
        "Poll delay",
        paragraph("From the ingress of the Sync to the call, in the host's clock (CLOCK_REALTIME). "
                  "If ptp4l stamps with another clock, what is between the two is in it.") +
            seriesPart({"delay", "Poll delay over time"}, recording.pairs->delays(), recording));
}

std::string offsetSections(const Recording& recording, const Limits* limits) {
    const auto& offsets = recording.pairs->offsets();
    return section("Offset", paragraph("Local minus reference time, at the time of the call.") +
                                 leftOut(recording.counts) +
                                 seriesPart({"offset", "Offset over time"}, offsets, recording)) +
           histogramSection(offsets.values()) + timeErrorSections(*recording.pairs, limits);
}

} // namespace

std::string pairSections(const Recording& recording, const Limits* limits) {
    const auto& counts = recording.counts;
    return (counts.onlyZeros()
                ? section("Offset", paragraph("No offset is a measurement.") + leftOut(counts))
                : offsetSections(recording, limits)) +
           intervalSection(recording) + delaySection(recording);
}

} // namespace vantelhost
