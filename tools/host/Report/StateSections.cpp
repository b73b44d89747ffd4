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

std::string atSecond(double seconds) {
    return fmt::format("{:.3f} s", seconds);
}

/// The table with the first of its rows, and how many there are.
std::string cappedTable(const Row& head, std::vector<Row> rows, std::size_t count) {
    rows.resize(std::min(rows.size(), longestTable));
    const auto more = count - rows.size();
    return table(head, rows) + (more == 0 ? "" : paragraph(fmt::format("... and {} more.", more)));
}

/// @param fullSince when changes began to be counted only
std::string timeLineParts(const Caption& caption, const TimeLine& timeLine, const TimeAxis& axis,
                          std::optional<double> fullSince) {
    if (timeLine.rows.size() > mostRows) {
        return paragraph("Too many rows for a drawing.");
    }
    std::string html = timeLineFigure(caption, timeLine, axis) + timeLineLegend(timeLine);
    if (fullSince) {
        html +=
            note(fmt::format("Too many changes: the drawing ends after {}.", atSecond(*fullSince)));
    }
    return html;
}

std::string qualitySection(const Recording& recording) {
    const auto timeLine = qualityTimeLine(recording);
    if (timeLine.spans.empty()) {
        return section("Quality", paragraph("No quality was reported."));
    }
    std::vector<Row> rows;
    const auto& changes = recording.qualities.items();
    for (std::size_t i = 0; i < changes.size(); ++i) {
        const auto& span = timeLine.spans[i];
        rows.push_back({atSecond(span.begin), shownDuration(span.end - span.begin),
                        changes[i].quality, changes[i].reason});
    }
    return section("Quality", timeLineParts({"quality", "Quality over time"}, timeLine,
                                            TimeAxis(recording), recording.qualities.fullSince()) +
                                  cappedTable({"at", "for", "quality", "reason"}, rows,
                                              recording.qualities.count()));
}

std::string portSection(const Recording& recording) {
    const auto timeLine = portTimeLine(recording);
    if (timeLine.spans.empty()) {
        return section("Port states", paragraph("No port was reported."));
    }
    std::vector<Row> rows;
    for (const auto& change : recording.portChanges.items()) {
        rows.push_back({atSecond(change.seconds), change.port,
                        change.state.empty() ? "not reported any more" : change.state});
    }
    return section("Port states",
                   timeLineParts({"ports", "Port states over time"}, timeLine, TimeAxis(recording),
                                 recording.portChanges.fullSince()) +
                       cappedTable({"at", "port", "state"}, rows, recording.portChanges.count()));
}

std::string problemSection(const Recording& recording) {
    const auto& problems = recording.problems;
    if (problems.count() == 0) {
        return section("Errors", paragraph("No errors, warnings or refused calls."));
    }
    std::vector<Row> rows;
    for (const auto& problem : problems.items()) {
        rows.push_back({atSecond(problem.seconds), problem.kind, problem.text});
    }
    return section("Errors", cappedTable({"at", "what", "text"}, rows, problems.count()));
}

} // namespace

std::string stateSections(const Recording& recording) {
    return qualitySection(recording) + portSection(recording) + problemSection(recording);
}

} // namespace vantelhost
