#include "Report/TimeErrorSections.h"

#include <algorithm>
#include <optional>
#include <vector>

#include <fmt/format.h>

#include "Report/Colours.h"
#include "Report/Figure.h"
#include "Report/Html.h"
#include "Report/TimeErrorFigures.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

/// Nanoseconds, to a hundredth: of values that are means.
std::string shownError(const std::optional<double>& value) {
    return value ? fmt::format("{:.2f} ns", *value) : "-";
}

std::string shownTau(double tau) {
    return fmt::format("{:.5g} s", tau);
}

std::string constantText(const TimeErrorFigures& figures) {
    if (!figures.constant) {
        return "mean of all: there are no 1000 s";
    }
    return fmt::format("of {} means of 1000 s the farthest from 0; they are from {} to {}",
                       figures.averages, shownError(figures.constant->low),
                       shownError(figures.constant->high));
}

std::string partsSection(const TimeErrorFigures& figures) {
    const std::vector<Row> rows{
        {"max|TE|", shownError(figures.largest()), "the largest offset, to either side"},
        {"mean", shownError(figures.mean), "of all offsets"},
        {"rms", shownError(figures.rms), "of all offsets, from 0"},
        {"cTE", shownError(figures.constantError()), constantText(figures)},
        {"dTE_L", shownError(figures.lowPassRange), "below 0.1 Hz, from peak to peak"},
        {"dTE_H", shownError(figures.highPassRange), "above 0.1 Hz, from peak to peak"}};
    return section(
        "Time error",
        paragraph("The time error TE is the offset: local minus reference time, as this clock "
                  "measures it. What its own measurement is wrong by, such as for a path that is "
                  "not as long in both directions, is not in it.") +
            table({"part", "value", "what it is"}, rows) +
            paragraph(fmt::format(
                "The filter is of first order; its first 8 s are left out. The offsets stand on a "
                "grid of {}, the mean distance of successive pairs. Places of the grid without an "
                "offset, from missed Syncs and gaps: {}. Nothing is interpolated: the filter "
                "stands still there, and a mean of which more than half is missing is left out.",
                shownTime(figures.interval * 1e9), figures.missing)));
}

std::string resultText(const LimitVerdict& verdict) {
    const std::string result = verdict.result;
    if (result == "open") {
        return "open: too short a time was measured";
    }
    return result == "none" ? "no limit yet" : result;
}

std::string limitsSection(const TimeErrorFigures& figures, const Limits& limits) {
    std::vector<Row> rows;
    for (const auto& each : verdictsOf(figures, limits)) {
        rows.push_back({each.quantity, shownError(each.value),
                        each.limit ? fmt::format("{:g} ns", *each.limit) : "-",
                        each.tau ? shownTau(*each.tau) : "-", resultText(each)});
    }
    return section(fmt::format("Limits of class {}", limits.letter),
                   paragraph(std::string(recommendation) +
                             ", at constant temperature. They are for what a measuring device "
                             "finds at the clock's output; this is what the clock finds itself.") +
                       table({"quantity", "worst", "limit", "at tau", "verdict"}, rows));
}

bool isVisible(const std::vector<TauValue>& values) {
    return std::any_of(values.begin(), values.end(),
                       [](const TauValue& each) { return each.value > 0; });
}

/// A measure of the time error, and of its part below 0.1 Hz.
struct Measure {
    const char* name = ""; ///< a word, unlike those of others
    const char* title = "";
    const char* text = "";  ///< how it is made
    const char* terms = ""; ///< what it is made of
    const std::vector<TauValue>& whole;
    const std::vector<TauValue>& low;
    std::optional<Mask> mask; ///< of what is below 0.1 Hz
};

/// From the shortest tau to the longest that is limited.
std::optional<Mask> maskOf(const std::vector<TauValue>& values, double limit) {
    return values.empty() ? std::nullopt
                          : std::optional(Mask{std::min(values.front().tau, longestLimitedTau),
                                               longestLimitedTau, limit});
}

std::string measureFigure(const Measure& measure) {
    if (!isVisible(measure.whole)) {
        return "";
    }
    std::vector<LegendEntry> entries{{dataColour, "time error"}};
    std::vector<Curve> curves{{measure.whole, dataColour}};
    if (isVisible(measure.low)) {
        entries.push_back({filteredColour, "below 0.1 Hz"});
        curves.push_back({measure.low, filteredColour});
    }
    if (measure.mask) {
        entries.push_back({maskColour, "limit for what is below 0.1 Hz"});
    }
    return tauFigure({measure.name, fmt::format("{} over tau", measure.title)},
                     fmt::format("{} in ns", measure.title), curves, measure.mask) +
           legend(entries);
}

/// The one at this tau, if there is one.
std::optional<double> valueAt(const std::vector<TauValue>& values, double tau) {
    const auto found = std::find_if(values.begin(), values.end(),
                                    [&](const TauValue& each) { return each.tau == tau; });
    return found == values.end() ? std::nullopt : std::optional(found->value);
}

std::string measureSection(const Measure& measure) {
    if (measure.whole.empty()) {
        return section(measure.title, paragraph("Too few pairs."));
    }
    std::vector<Row> rows;
    for (const auto& [tau, value, terms] : measure.whole) {
        rows.push_back({shownTau(tau), shownError(value), shownError(valueAt(measure.low, tau)),
                        fmt::format("{}", terms)});
    }
    return section(measure.title,
                   measureFigure(measure) + paragraph(measure.text) +
                       table({"tau", "time error", "below 0.1 Hz", measure.terms}, rows));
}

std::string mtieSection(const TimeErrorFigures& figures, const Limits* limits) {
    return measureSection(
        {"mtie", "MTIE",
         "The maximum time interval error: by how much the time error changes at most within any "
         "time tau. Where pairs are missing, by how much it is seen to change.",
         "windows", figures.whole.mtie, figures.low.mtie,
         limits == nullptr ? std::nullopt : maskOf(figures.whole.mtie, limits->mtie)});
}

std::string tdevSection(const TimeErrorFigures& figures, const Limits* limits) {
    return measureSection(
        {"tdev", "TDEV",
         "The time deviation, of the means of the time error in three successive times tau. A mean "
         "is that of the pairs that are there; where more than half are missing, the three are "
         "left out.",
         "sums", figures.whole.tdev, figures.low.tdev,
         limits == nullptr ? std::nullopt : maskOf(figures.whole.tdev, limits->tdev)});
}

std::string allanSection(const std::vector<TauValue>& deviations) {
    if (deviations.empty()) {
        return section("Allan deviation", paragraph("Too few pairs."));
    }
    std::vector<Row> rows;
    rows.reserve(deviations.size());
    for (const auto& [tau, value, terms] : deviations) {
        rows.push_back({shownTau(tau), fmt::format("{:.3e}", value), fmt::format("{}", terms)});
    }
    const auto drawn = isVisible(deviations)
                           ? tauFigure({"deviation", "Allan deviation over the averaging time"},
                                       "deviation", {{deviations, dataColour}}, std::nullopt)
                           : "";
    return section("Allan deviation",
                   drawn +
                       paragraph("Overlapping Allan deviation of the offset as time error. Sums "
                                 "that need a place without an offset are left out.") +
                       table({"tau", "deviation", "sums"}, rows));
}

} // namespace

std::string timeErrorSections(const PairSeries& pairs, const Limits* limits) {
    const auto figures = figuresOf(pairs);
    return partsSection(figures) + (limits == nullptr ? "" : limitsSection(figures, *limits)) +
           mtieSection(figures, limits) + tdevSection(figures, limits) +
           allanSection(figures.deviations);
}

} // namespace vantelhost
