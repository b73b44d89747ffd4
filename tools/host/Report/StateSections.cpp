#include "Report/StateSections.h"

#include <algorithm>
#include <optional>
#include <vector>

#include <fmt/format.h>

#include "Report/Html.h"
#include "Report/TimeLine.h"
#include "Report/TimeLineFigure.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

constexpr std::size_t longestTable = 200;
constexpr std::size_t mostRows = 64; ///< of a time line

std::string momentAt(const Recording& recording, double seconds) {
    return shownMoment(recording.begin + static_cast<std::uint64_t>(seconds * 1e9));
}

/// Many seconds say little.
std::string shownAt(const Recording& recording, double seconds) {
    constexpr double day = 86400;
    return recording.duration <= day ? fmt::format("{:.3f} s", seconds)
                                     : momentAt(recording, seconds);
}

/// The table with the first of its rows, and how many there are.
std::string cappedTable(const Row& head, std::vector<Row> rows, std::size_t count) {
    rows.resize(std::min(rows.size(), longestTable));
    const auto more = count - rows.size();
    return table(head, rows) + (more == 0 ? "" : paragraph(fmt::format("... and {} more.", more)));
}

/// @param fullSince when changes began to be counted only; empty when they did not
std::string timeLineParts(const Caption& caption, const TimeLine& timeLine, const TimeAxis& axis,
                          const std::string& fullSince) {
    if (timeLine.rows.size() > mostRows) {
        return paragraph("Too many rows for a drawing.");
    }
    std::string html = timeLineFigure(caption, timeLine, axis) + timeLineLegend(timeLine);
    if (!fullSince.empty()) {
        html += note(fmt::format("Too many changes: the drawing ends after {}.", fullSince));
    }
    return html;
}

template <typename Change>
std::string fullSince(const First<Change>& changes, const Recording& recording) {
    return changes.fullSince() ? shownAt(recording, *changes.fullSince()) : "";
}

/// A row for each time in a state that is known.
std::vector<Row> stateRows(const First<StateChange>& states, const TimeLine& timeLine,
                           const Recording& recording) {
    std::vector<Row> rows;
    auto span = timeLine.spans.begin();
    for (const auto& change : states.items()) {
        if (!change.state.empty()) {
            rows.push_back({shownAt(recording, span->begin), shownDuration(span->end - span->begin),
                            change.state, change.reason});
            ++span;
        }
    }
    return rows;
}

std::string stateSection(const char* title, const Caption& caption, const TimeLine& timeLine,
                         const First<StateChange>& states, const Recording& recording) {
    return section(
        title, timeLineParts(caption, timeLine, TimeAxis(recording), fullSince(states, recording)) +
                   cappedTable({"at", "for", caption.name, "reason"},
                               stateRows(states, timeLine, recording), states.count()));
}

std::string healthSection(const Recording& recording) {
    return recording.healths.count() == 0
               ? ""
               : stateSection("Health", {"health", "Health over time"}, healthTimeLine(recording),
                              recording.healths, recording);
}

std::string qualitySection(const Recording& recording) {
    const auto timeLine = qualityTimeLine(recording);
    if (timeLine.spans.empty()) {
        return section("Quality", paragraph("No quality was reported."));
    }
    return stateSection("Quality", {"quality", "Quality over time"}, timeLine, recording.qualities,
                        recording);
}

std::string portSection(const Recording& recording) {
    const auto timeLine = portTimeLine(recording);
    if (timeLine.spans.empty()) {
        return section("Port states", paragraph("No port was reported."));
    }
    std::vector<Row> rows;
    for (const auto& change : recording.portChanges.items()) {
        rows.push_back({shownAt(recording, change.seconds), change.port,
                        change.state.empty() ? "not reported any more" : change.state});
    }
    return section("Port states",
                   timeLineParts({"ports", "Port states over time"}, timeLine, TimeAxis(recording),
                                 fullSince(recording.portChanges, recording)) +
                       cappedTable({"at", "port", "state"}, rows, recording.portChanges.count()));
}

std::string problemSection(const Recording& recording) {
    const auto& problems = recording.problems;
    if (problems.count() == 0) {
        return section("Errors", paragraph("No errors, warnings or refused calls."));
    }
    std::vector<Row> rows;
    for (const auto& problem : problems.items()) {
        rows.push_back({shownAt(recording, problem.seconds), problem.kind, problem.text});
    }
    return section("Errors", cappedTable({"at", "what", "text"}, rows, problems.count()));
}

} // namespace

std::string gapSection(const Recording& recording) {
    if (recording.gaps.count() == 0) {
        return "";
    }
    std::vector<Row> rows;
    for (const auto& gap : recording.gaps.items()) {
        rows.push_back({momentAt(recording, gap.seconds),
                        gap.length > 0 ? shownDuration(gap.length) : "-", gap.text});
    }
    return section("Gaps", cappedTable({"at", "for", "what"}, rows, recording.gaps.count()));
}

std::string stateSections(const Recording& recording) {
    return healthSection(recording) + qualitySection(recording) + portSection(recording) +
           problemSection(recording);
}

} // namespace vantelhost
