#include "Report/Page.h"

#include <algorithm>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Report/Html.h"
#include "Report/JsonText.h"
#include "Report/PairSections.h"
#include "Report/StateSections.h"
#include "Report/Style.h"
#include "Report/TimeLine.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

/// Why the run was in vain, and what to do about it.
std::string causeNote(const Recording& recording) {
    if (recording.cause.empty()) {
        return "";
    }
    return note(recording.cause + (recording.mend.empty() ? "" : " -- mend: " + recording.mend));
}

/// What a reader must know before the figures.
std::string notes(const Recording& recording) {
    if (recording.lines == 0) {
        return note("The recording is empty.");
    }
    std::string html = causeNote(recording);
    if (recording.truncated) {
        html += note("The last line of the recording is cut; it is left out.");
    }
    if (!recording.summarised) {
        html += note("The recording has no summary: the host still ran, or was killed.");
    }
    // The cause may say so already, of the pairs as the run counted them.
    const bool isTold = recording.cause.find("no delay is measured") != std::string::npos;
    if (recording.counts.onlyZeros() && !isTold) {
        html += note(noDelayText(0, recording.counts.falseOffsets));
    }
    if (recording.gaps.count() > 0) {
        html += note(fmt::format("Not all is here, or in its order: {} gap{}, see below.",
                                 recording.gaps.count(), recording.gaps.count() == 1 ? "" : "s"));
    }
    return html;
}

std::string pairCount(const PairCounts& counts) {
    std::string text = fmt::format("{}", counts.all());
    if (counts.of1970 > 0) {
        text += fmt::format(", {} of 1970", counts.of1970);
    }
    if (counts.falseOffsets > 0) {
        text += fmt::format(", {} with a false offset", counts.falseOffsets);
    }
    if (counts.distrusted > 0) {
        text += fmt::format(", {} not believed", counts.distrusted);
    }
    return text;
}

std::string pairRate(double rate) {
    return rate > 0 ? fmt::format("{:.3g} each second", rate) : "-";
}

/// What a recording of one file and one run has not.
std::vector<Row> sizeRows(const Recording& recording) {
    std::vector<Row> rows;
    for (const auto& [name, count] :
         {std::pair("Files", recording.files), std::pair("Runs", recording.runs)}) {
        if (count > 1) {
            rows.push_back({name, fmt::format("{}", count)});
        }
    }
    return rows;
}

std::string summarySection(const Recording& recording) {
    const auto qualities = qualityTimeLine(recording);
    const double usable = timeIn(qualities, "usable");
    const double share = recording.duration > 0 ? 100 * usable / recording.duration : 0;
    std::vector<Row> rows{
        {"Begin", shownMoment(recording.begin)},
        {"Duration", shownDuration(recording.duration)},
        {"Plug-in", recording.plugIn + ", " + recording.plugInFile},
        {"End", recording.stopCause.empty() ? "not recorded" : recording.stopCause},
        {"Time pairs", pairCount(recording.counts)},
        {"Rate of pairs", pairRate(recording.pairs->rate())},
        {"Quality usable", fmt::format("{} ({:.1f} %)", shownDuration(usable), share)},
        {"Changes of quality", fmt::format("{}", recording.qualities.count())},
        {"Errors", fmt::format("{}", recording.errors)},
        {"Warnings", fmt::format("{}", recording.warnings)},
        {"Refused calls", fmt::format("{}", recording.refused)},
    };
    if (recording.restarts > 0) {
        rows.push_back({"Restarted sessions", fmt::format("{}", recording.restarts)});
    }
    if (recording.epochOffsets > 0) {
        rows.push_back(
            {"Epoch offset", fmt::format("{} ns, written {} times", recording.epochOffset,
                                         recording.epochOffsets)});
    }
    if (recording.chrony) {
        rows.push_back(
            {"To chronyd", fmt::format("{} pairs sent, {} failed", recording.chrony->sent,
                                       recording.chrony->failed)});
    }
    const auto sizes = sizeRows(recording);
    rows.insert(rows.begin() + 2, sizes.begin(), sizes.end());
    return section("Summary", table({}, rows));
}

/// The members of an object that are no objects themselves.
std::string memberTable(const Json& object) {
    std::vector<Row> rows;
    for (const auto& [key, value] : object.items()) {
        if (!value.is_object()) {
            rows.push_back({key, jsonText(value)});
        }
    }
    return table({"name", "value"}, rows);
}

/// A column for each port, a row for each member that any port has.
std::string portTable(const Json& metadata) {
    Row head{"port"};
    std::vector<Row> rows;
    for (const auto& [name, port] : metadata.items()) {
        if (!port.is_object()) {
            continue;
        }
        for (const auto& [key, value] : port.items()) {
            auto row = std::find_if(rows.begin(), rows.end(), [&, wanted = key](const Row& each) {
                return each[0] == wanted;
            });
            if (row == rows.end()) {
                row = rows.insert(rows.end(), Row{key});
            }
            row->resize(head.size());
            row->push_back(jsonText(value));
        }
        head.push_back(name);
    }
    for (auto& row : rows) {
        row.resize(head.size());
    }
    return rows.empty() ? "" : table(head, rows);
}

std::string sections(const Recording& recording, const Limits* limits) {
    std::string html = summarySection(recording) + gapSection(recording);
    html += recording.pairs->empty()
                ? section("Offset",
                          paragraph(recording.counts.all() == 0 ? "There are no time pairs."
                                                                : "No pair is a measurement."))
                : pairSections(recording, limits);
    html += stateSections(recording);
    if (recording.metadata.is_object()) {
        html += section("Last metadata",
                        memberTable(recording.metadata) + portTable(recording.metadata));
    }
    if (recording.configuration.is_object()) {
        html += section("Settings", memberTable(recording.configuration));
    }
    return html;
}

} // namespace

std::string reportPage(const Recording& recording, const std::string& name, const Limits* limits) {
    return fmt::format(
        "<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\" />\n"
        "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\" />\n"
        "<title>{0}</title>\n<style>{1}</style>\n</head>\n<body>\n"
        "<h1>{0}</h1>\n<p>Recording of vantel-host</p>\n{2}{3}</body>\n</html>\n",
        escaped(name), pageStyle, notes(recording),
        recording.lines == 0 ? "" : sections(recording, limits));
}

} // namespace vantelhost
