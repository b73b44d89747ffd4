#include "Report/RecordingBuilder.h"

#include <algorithm>
#include <array>
#include <deque>
#include <string_view>

#include <fmt/format.h>

#include "Events.h"
#include "Report/JsonText.h"

namespace vantelhost {

namespace {

std::string portLabel(const std::string& name, const Json& port) {
    const auto interface = jsonText(port, "interface");
    return interface.empty() ? name : name + " " + interface;
}

std::map<std::string, std::string> portStatesOf(const Json& metadata) {
    std::map<std::string, std::string> states;
    for (const auto& [name, value] : metadata.items()) {
        if (value.is_object()) {
            states[portLabel(name, value)] = jsonText(value, "portState");
        }
    }
    return states;
}

bool isProblem(std::string_view event) {
    constexpr std::array<std::string_view, 7> problems{
        "error", "warning", "refused", "daemon-ended", "restart", "cause", "mend"};
    return std::find(problems.begin(), problems.end(), event) != problems.end();
}

/// As the host told it.
std::string daemonEndText(const Json& line) {
    const bool bySignal = line.contains("signal");
    const ChildEnd end{line.at("pid").get<pid_t>(), bySignal,
                       line.at(bySignal ? "signal" : "status").get<int>()};
    return daemonEndedEvent(end, line.at("words").get<std::deque<std::string>>()).text;
}

/// What went wrong, in words.
std::string problemText(const std::string& kind, const Json& line) {
    if (kind == "daemon-ended") {
        return daemonEndText(line);
    }
    std::string text;
    for (const char* key :
         {"operation", "function", "code", "problem", "status", "text", "cause"}) {
        const auto word = jsonText(line, key);
        text += (text.empty() || word.empty() ? "" : ": ") + word;
    }
    return text;
}

void count(PairCounts& counts, PairKind kind) {
    counts.measured += kind == PairKind::measured ? 1U : 0U;
    counts.of1970 += kind == PairKind::of1970 ? 1U : 0U;
    counts.falseOffsets += kind == PairKind::falseOffset ? 1U : 0U;
    counts.distrusted += kind > PairKind::falseOffset ? 1U : 0U;
}

} // namespace

void RecordingBuilder::interrupt(double seconds) {
    if (!lastQuality_.first.empty()) {
        recording_.qualities.keep({seconds, "", ""});
        lastQuality_ = {};
    }
    if (!lastHealth_.empty()) {
        recording_.healths.keep({seconds, "", ""});
        lastHealth_.clear();
    }
    takePorts({}, seconds);
    recording_.pairs->interrupt();
    beginSession();
}

void RecordingBuilder::beginSession() {
    filter_ = PairFilter();
    recording_.epochOffset = 0;
}

void RecordingBuilder::take(const std::string& event, const Json& line, double seconds) {
    if (event == "metadata") {
        takeMetadata(line, seconds);
    } else if (isProblem(event)) {
        takeProblem(event, line, seconds);
    } else if (event == "lost") {
        takeLoss(line, seconds);
    } else if (event == "chrony") {
        recording_.chrony = ChronyCount{line.at("sent").get<std::uint64_t>(),
                                        line.at("failed").get<std::uint64_t>()};
    } else if (event == "stopping") {
        recording_.stopCause = line.at("cause").get<std::string>();
    } else if (event == "summary") {
        recording_.summarised = true;
    } else {
        takeOld(event, line, seconds);
        recording_.epochOffsets += event == "epoch-offset" ? 1U : 0U;
    }
}

void RecordingBuilder::takeOld(const std::string& event, const Json& line, double seconds) {
    if (event == "quality") {
        takeQuality(line, seconds);
    } else if (event == "health") {
        takeHealth(line, seconds);
    } else if (event == "metadata") {
        takeMetadata(line, seconds);
    } else if (event == "loaded") {
        recording_.plugIn = line.at("name").get<std::string>();
        recording_.plugInFile = line.at("library").get<std::string>();
    } else if (event == "initialised") {
        recording_.configuration = line.at("configuration");
    } else if (event == "epoch-offset") {
        recording_.epochOffset = line.at("offset").get<std::int64_t>();
        filter_.epochOffset(recording_.epochOffset);
    }
}

void RecordingBuilder::takePair(const PairLine& line, double seconds) {
    const auto ingress = line.local - static_cast<std::uint64_t>(recording_.epochOffset);
    const auto delay = static_cast<std::int64_t>(line.time - line.realtime.value_or(ingress));
    const auto found = filter_.pair(line.local, line.offset);
    const auto kind = judgementOf(line.leftOut).value_or(found);
    const bool onlyZerosBefore = recording_.counts.onlyZeros();
    count(recording_.counts, kind);
    if (onlyZerosBefore && kind == PairKind::measured) {
        recording_.pairs = std::make_unique<PairSeries>();
    }
    if (kind == PairKind::measured ||
        (kind == PairKind::falseOffset && recording_.counts.onlyZeros())) {
        recording_.pairs->add({seconds, ingress, line.offset, delay});
    }
}

void RecordingBuilder::takeQuality(const Json& line, double seconds) {
    const StateChange change{seconds, line.at("quality").get<std::string>(),
                             line.at("reason").get<std::string>()};
    filter_.quality(change.state, change.reason);
    if (lastQuality_ != std::pair(change.state, change.reason)) {
        recording_.qualities.add(change);
        lastQuality_ = {change.state, change.reason};
    }
}

void RecordingBuilder::takeHealth(const Json& line, double seconds) {
    if (lastHealth_.empty() && line.contains("before")) {
        const double spent = std::clamp(line.at("spent").get<double>(), 0.0, seconds);
        recording_.healths.add({seconds - spent, line.at("before").get<std::string>(), ""});
    }
    lastHealth_ = line.at("state").get<std::string>();
    recording_.healths.add({seconds, lastHealth_, line.at("reason").get<std::string>()});
}

void RecordingBuilder::takeMetadata(const Json& line, double seconds) {
    if (!line.at("valid").get<bool>()) {
        ++recording_.errors;
        recording_.problems.add(
            {seconds, "error", "metadata is no JSON object: " + jsonText(line, "text")});
        return;
    }
    recording_.metadata = line.at("metadata");
    takePorts(portStatesOf(recording_.metadata), seconds);
}

void RecordingBuilder::takePorts(std::map<std::string, std::string> states, double seconds) {
    for (const auto& [port, state] : states) {
        if (portStates_[port] != state) {
            recording_.portChanges.add({seconds, port, state});
        }
    }
    for (const auto& [port, state] : portStates_) {
        if (!state.empty() && states.count(port) == 0) {
            recording_.portChanges.add({seconds, port, ""});
        }
    }
    portStates_ = std::move(states);
}

void RecordingBuilder::takeProblem(const std::string& kind, const Json& line, double seconds) {
    const auto text = problemText(kind, line);
    recording_.problems.add({seconds, kind, text});
    if (kind == "error") {
        ++recording_.errors;
    } else if (kind == "warning") {
        ++recording_.warnings;
    } else if (kind == "refused") {
        ++recording_.refused;
    } else if (kind == "restart") {
        ++recording_.restarts;
        recording_.stopCause.clear();
        beginSession();
    } else if (kind == "cause") {
        ++recording_.errors;
        recording_.cause = text;
    } else if (kind == "mend") {
        recording_.mend = text;
    }
}

void RecordingBuilder::takeLoss(const Json& line, double seconds) {
    const auto length = std::clamp(line.at("seconds").get<double>(), 0.0, seconds);
    recording_.gaps.add(
        {seconds - length, length,
         fmt::format("{} events could not be written: {}", line.at("events").get<std::uint64_t>(),
                     line.at("problem").get<std::string>())});
    recording_.pairs->interrupt();
}

} // namespace vantelhost
