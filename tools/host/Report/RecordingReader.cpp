#include "Report/RecordingReader.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <deque>
#include <stdexcept>
#include <string_view>
#include <vector>

#include <fmt/format.h>

#include "Events.h"
#include "Report/JsonText.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

/// What a line of a file that is no record may at most take up.
constexpr std::size_t longestLine = std::size_t{1} << 20U;

/// Deeper ones would not be safe to walk.
constexpr int deepest = 100;

Json parsed(std::string_view text) {
    return Json::parse(text.begin(), text.end(), [](int depth, Json::parse_event_t, const Json&) {
        return depth <= deepest ? true : throw std::runtime_error("nested too deep");
    });
}

std::string portLabel(const std::string& name, const Json& port) {
    const auto interface = jsonText(port, "interface");
    return interface.empty() ? name : name + " " + interface;
}

bool isProblem(std::string_view event) {
    constexpr std::array<std::string_view, 6> problems{"error",        "warning", "refused",
                                                       "daemon-ended", "cause",   "mend"};
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
    for (const char* key : {"operation", "function", "code", "problem", "status", "text"}) {
        const auto word = jsonText(line, key);
        text += (text.empty() || word.empty() ? "" : ": ") + word;
    }
    return text;
}

} // namespace

Recording RecordingReader::read(std::istream& stream, const std::string& name) {
    RecordingReader reader;
    auto& recording = reader.recording_;
    std::vector<char> buffer(longestLine);
    while (stream.getline(buffer.data(), static_cast<std::streamsize>(buffer.size()))) {
        // The count holds the line's end, if there is one.
        const bool isWhole = !stream.eof();
        const auto length = static_cast<std::size_t>(stream.gcount()) - (isWhole ? 1 : 0);
        const std::string_view text(buffer.data(), length);
        try {
            reader.take(parsed(text));
        } catch (const std::exception& error) {
            if (!isWhole) {
                recording.truncated = true;
                break;
            }
            throw UsageError(fmt::format("{}:{}: this is no record of vantel-host: {}", name,
                                         recording.lines + 1, error.what()));
        }
        ++recording.lines;
    }
    if (stream.bad()) {
        throw UsageError(fmt::format("cannot read {}: {}", name, errorText(errno)));
    }
    if (!stream.eof()) {
        throw UsageError(
            fmt::format("{}:{}: this is no record of vantel-host: the line is too long", name,
                        recording.lines + 1));
    }
    return recording;
}

void RecordingReader::take(const Json& line) {
    const auto& event = line.at("event").get_ref<const std::string&>();
    takeMoment(line);
    if (event == "pair") {
        takePair(line);
    } else if (event == "quality") {
        takeQuality(line);
    } else if (event == "metadata") {
        takeMetadata(line);
    } else if (isProblem(event)) {
        takeProblem(event, line);
    } else {
        takeOther(event, line);
    }
}

void RecordingReader::takeMoment(const Json& line) {
    const auto seconds = line.at("t").get<double>();
    const auto time = line.at("time").get<std::uint64_t>();
    // A year of 366 days, a hundred times.
    if (seconds < seconds_ || seconds > 3.2e9) {
        throw std::runtime_error("t goes back, or is out of range");
    }
    if (recording_.lines == 0) {
        recording_.begin = time - static_cast<std::uint64_t>(seconds * 1e9);
    }
    seconds_ = seconds;
    recording_.duration = seconds;
}

void RecordingReader::takePair(const Json& line) {
    const auto local = line.at("local").get<std::uint64_t>();
    const auto offset = line.at("offset").get<std::int64_t>();
    const auto ingress = local - static_cast<std::uint64_t>(recording_.epochOffset);
    const auto delay = static_cast<std::int64_t>(line.at("time").get<std::uint64_t>() - ingress);
    const bool onlyZerosBefore = recording_.counts.onlyZeros();
    const auto kind = filter_.pair(local, offset);
    recording_.counts = filter_.counts();
    if (onlyZerosBefore && kind == PairKind::measured) {
        recording_.pairs.clear();
    }
    if (kind == PairKind::measured ||
        (kind == PairKind::falseOffset && recording_.counts.onlyZeros())) {
        recording_.pairs.push_back({seconds_, ingress, offset, delay});
    }
}

void RecordingReader::takeQuality(const Json& line) {
    const QualityChange change{seconds_, line.at("quality").get<std::string>(),
                               line.at("reason").get<std::string>()};
    filter_.quality(change.quality, change.reason);
    if (lastQuality_ != std::pair(change.quality, change.reason)) {
        recording_.qualities.add(change);
        lastQuality_ = {change.quality, change.reason};
    }
}

void RecordingReader::takeMetadata(const Json& line) {
    if (!line.at("valid").get<bool>()) {
        ++recording_.errors;
        recording_.problems.add(
            {seconds_, "error", "metadata is no JSON object: " + jsonText(line, "text")});
        return;
    }
    recording_.metadata = line.at("metadata");
    takePorts(recording_.metadata);
}

void RecordingReader::takePorts(const Json& metadata) {
    std::map<std::string, std::string> states;
    for (const auto& [name, value] : metadata.items()) {
        if (value.is_object()) {
            states[portLabel(name, value)] = jsonText(value, "portState");
        }
    }
    for (const auto& [port, state] : states) {
        if (portStates_[port] != state) {
            recording_.portChanges.add({seconds_, port, state});
        }
    }
    for (const auto& [port, state] : portStates_) {
        if (!state.empty() && states.count(port) == 0) {
            recording_.portChanges.add({seconds_, port, ""});
        }
    }
    portStates_ = std::move(states);
}

void RecordingReader::takeProblem(const std::string& kind, const Json& line) {
    const auto text = problemText(kind, line);
    recording_.problems.add({seconds_, kind, text});
    if (kind == "error") {
        ++recording_.errors;
    } else if (kind == "warning") {
        ++recording_.warnings;
    } else if (kind == "refused") {
        ++recording_.refused;
    } else if (kind == "cause") {
        ++recording_.errors;
        recording_.cause = text;
    } else if (kind == "mend") {
        recording_.mend = text;
    }
}

void RecordingReader::takeOther(const std::string& event, const Json& line) {
    if (event == "loaded") {
        if (!recording_.plugInFile.empty()) {
            throw std::runtime_error("another recording begins");
        }
        recording_.plugIn = line.at("name").get<std::string>();
        recording_.plugInFile = line.at("library").get<std::string>();
    } else if (event == "initialised") {
        recording_.configuration = line.at("configuration");
    } else if (event == "epoch-offset") {
        ++recording_.epochOffsets;
        recording_.epochOffset = line.at("offset").get<std::int64_t>();
        filter_.epochOffset(recording_.epochOffset);
    } else if (event == "chrony") {
        recording_.chrony = ChronyCount{line.at("sent").get<std::uint64_t>(),
                                        line.at("failed").get<std::uint64_t>()};
    } else if (event == "stopping") {
        recording_.stopCause = line.at("cause").get<std::string>();
    } else if (event == "summary") {
        recording_.summarised = true;
    }
}

} // namespace vantelhost
