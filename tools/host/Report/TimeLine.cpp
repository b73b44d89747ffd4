#include "Report/TimeLine.h"

#include <algorithm>
#include <map>

namespace vantelhost {

namespace {

/// The row's number; a new row if there is none yet.
std::size_t rowNumber(TimeLine& timeLine, const std::string& row) {
    auto& rows = timeLine.rows;
    const auto found = std::find(rows.begin(), rows.end(), row);
    const auto number = static_cast<std::size_t>(found - rows.begin());
    if (found == rows.end()) {
        rows.push_back(row);
    }
    return number;
}

/// What is known ends with the recording, or where changes were only counted.
template <typename Change>
double endOf(const First<Change>& changes, const Recording& recording) {
    return changes.fullSince().value_or(recording.duration);
}

/// A row for each state; times in which none is known are left out.
template <typename Label>
TimeLine stateTimeLine(const First<StateChange>& states, const Recording& recording, Label label) {
    TimeLine timeLine;
    const auto& changes = states.items();
    for (std::size_t i = 0; i < changes.size(); ++i) {
        const auto& change = changes[i];
        const double end =
            i + 1 < changes.size() ? changes[i + 1].seconds : endOf(states, recording);
        if (!change.state.empty()) {
            timeLine.spans.push_back(
                {rowNumber(timeLine, change.state), change.seconds, end, label(change)});
        }
    }
    return timeLine;
}

} // namespace

TimeLine qualityTimeLine(const Recording& recording) {
    return stateTimeLine(recording.qualities, recording, [](const StateChange& change) {
        return change.state + ": " + change.reason;
    });
}

TimeLine healthTimeLine(const Recording& recording) {
    return stateTimeLine(recording.healths, recording,
                         [](const StateChange& change) { return change.state; });
}

TimeLine portTimeLine(const Recording& recording) {
    TimeLine timeLine;
    std::map<std::string, PortChange> present;
    const auto close = [&](const std::string& port, double end) {
        const auto found = present.find(port);
        if (found != present.end()) {
            const auto& [seconds, name, state] = found->second;
            timeLine.spans.push_back({rowNumber(timeLine, name), seconds, end, state});
            present.erase(found);
        }
    };
    for (const auto& change : recording.portChanges.items()) {
        close(change.port, change.seconds);
        if (!change.state.empty()) {
            present[change.port] = change;
        }
    }
    while (!present.empty()) {
        // A copy: closing takes the entry away.
        const auto port = present.begin()->first;
        close(port, endOf(recording.portChanges, recording));
    }
    return timeLine;
}

std::vector<Span> outages(const Recording& recording) {
    std::vector<Span> result;
    const auto qualities = qualityTimeLine(recording);
    for (const auto& span : qualities.spans) {
        if (qualities.rows[span.row] == "usable") {
            continue;
        }
        if (!result.empty() && result.back().end == span.begin) {
            result.back().end = span.end;
        } else {
            result.push_back({0, span.begin, span.end, ""});
        }
    }
    return result;
}

std::vector<std::string> labelsOf(const TimeLine& timeLine) {
    std::vector<std::string> labels;
    for (const auto& span : timeLine.spans) {
        if (std::find(labels.begin(), labels.end(), span.label) == labels.end()) {
            labels.push_back(span.label);
        }
    }
    return labels;
}

double timeIn(const TimeLine& timeLine, const std::string& row) {
    double sum = 0;
    for (const auto& span : timeLine.spans) {
        sum += timeLine.rows[span.row] == row ? span.end - span.begin : 0;
    }
    return sum;
}

} // namespace vantelhost
