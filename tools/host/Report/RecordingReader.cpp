#include "Report/RecordingReader.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <stdexcept>

#include <fmt/format.h>

#include "Report/Units.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

/// What a line of a file that is no record may at most take up.
constexpr std::size_t longestLine = std::size_t{1} << 20U;

/// So many lines without an event show that a file is no record.
constexpr std::uint64_t hopeless = 1000;

/// Deeper ones would not be safe to walk.
constexpr int deepest = 100;

Json parsed(std::string_view text) {
    return Json::parse(text.begin(), text.end(), [](int depth, Json::parse_event_t, const Json&) {
        return depth <= deepest ? true : throw std::runtime_error("nested too deep");
    });
}

Moment momentOf(const Json& line) {
    return {line.at("t").get<double>(), line.at("time").get<std::uint64_t>()};
}

/// Valid as long as the line is.
PairLine pairOf(const Json& line) {
    PairLine pair{line.at("t").get<double>(),
                  line.at("time").get<std::uint64_t>(),
                  line.at("local").get<std::uint64_t>(),
                  line.at("offset").get<std::int64_t>(),
                  {},
                  {}};
    if (const auto leftOut = line.find("leftOut"); leftOut != line.end()) {
        pair.leftOut = leftOut->get_ref<const std::string&>();
    }
    if (const auto realtime = line.find("realtime"); realtime != line.end()) {
        pair.realtime = realtime->get<std::uint64_t>();
    }
    return pair;
}

std::string clockText(double set) {
    return fmt::format("the host's clock was set {} by {}{}", set > 0 ? "forward" : "back",
                       shownDuration(std::abs(set)), set > 0 ? ", or the machine slept" : "");
}

/// @param passed since the run before, by the host's clock, seconds
std::string pauseText(double passed, bool isSummarised) {
    std::string text = "another run begins";
    text += isSummarised ? "" : "; the one before has no summary: it was killed";
    text += passed < 0 ? fmt::format("; the host's clock was set back by {}, or the files are out "
                                     "of order",
                                     shownDuration(-passed))
                       : "";
    return text;
}

} // namespace

void RecordingReader::read(std::istream& stream, const std::string& name) {
    beginFile(name);
    LineReader lines(stream, longestLine);
    while (const auto line = lines.next()) {
        ++lineNumber_;
        takeLine(*line);
        if (!hasEvent_ && lineNumber_ >= hopeless) {
            break;
        }
    }
    if (stream.bad()) {
        throw UsageError(fmt::format("cannot read {}: {}", name, errorText(errno)));
    }
    endFile();
}

Recording RecordingReader::finish() {
    auto& recording = builder_.recording();
    recording.begin = axis_.origin();
    recording.duration = axis_.seconds();
    recording.pairs->finish();
    return std::move(recording);
}

void RecordingReader::beginFile(const std::string& name) {
    auto& recording = builder_.recording();
    if (std::exchange(recording.truncated, false)) {
        tell(fmt::format("{}:{}: the last line is cut", name_, lineNumber_));
    }
    ++recording.files;
    name_ = name;
    lineNumber_ = 0;
    hasEvent_ = false;
    firstProblem_.clear();
}

void RecordingReader::endFile() const {
    if (!hasEvent_ && !firstProblem_.empty()) {
        throw UsageError(firstProblem_);
    }
}

void RecordingReader::takeLine(const LineReader::Line& line) {
    if (line.isTooLong) {
        leaveOut("the line is too long");
        return;
    }
    try {
        takeText(line.text);
        hasEvent_ = true;
        ++builder_.recording().lines;
    } catch (const std::exception& error) {
        if (line.isWhole) {
            leaveOut(error.what());
        } else {
            builder_.recording().truncated = true;
        }
    }
}

void RecordingReader::takeText(std::string_view text) {
    // Nearly all lines are pairs behind other lines.
    if (hasEvent_) {
        if (const auto pair = parsePairLine(text)) {
            follow({pair->t, pair->time});
            builder_.takePair(*pair, axis_.seconds());
            return;
        }
    }
    const Json line = parsed(text);
    const auto& event = line.at("event").get_ref<const std::string&>();
    if (event == "pair") {
        const auto pair = pairOf(line);
        place(event, line, momentOf(line));
        builder_.takePair(pair, axis_.seconds());
    } else {
        place(event, line, momentOf(line));
        builder_.take(event, line, axis_.seconds());
    }
}

void RecordingReader::place(const std::string& event, const Json& line, const Moment& moment) {
    if (event == "continued") {
        takeContinued(line, moment);
    } else if (builder_.recording().runs == 0) {
        beginRun(moment, beginOf(moment), true);
    } else if (event == "loaded" || (!hasEvent_ && !axis_.mayFollow(moment))) {
        beginRun(moment, beginOf(moment), event == "loaded");
    } else {
        follow(moment);
    }
}

void RecordingReader::follow(const Moment& moment) {
    const double set = axis_.follow(moment);
    if (set != 0) {
        tell(clockText(set));
    }
}

void RecordingReader::beginRun(const Moment& moment, std::uint64_t begin, bool fromStart) {
    auto& recording = builder_.recording();
    const double end = axis_.seconds();
    const double passed = axis_.begin(moment, fromStart);
    if (recording.runs > 0) {
        builder_.interrupt(end);
        recording.gaps.add({end, axis_.seconds() - end, pauseText(passed, recording.summarised)});
    }
    ++recording.runs;
    recording.summarised = false;
    recording.stopCause.clear();
    recording.cause.clear();
    recording.mend.clear();
    runBegin_ = begin;
    part_ = 0;
}

/// What was told before counts where a part is missing.
void RecordingReader::takeContinued(const Json& line, const Moment& moment) {
    const auto begin = line.at("begin").get<std::uint64_t>();
    const auto part = line.at("part").get<std::uint64_t>();
    const double end = axis_.seconds();
    const bool isSameRun = builder_.recording().runs > 0 && begin == runBegin_;
    if (isSameRun) {
        follow(moment);
    } else {
        beginRun(moment, begin, false);
    }
    const auto missing = part - std::min(part, isSameRun ? part_ + 1 : 0);
    part_ = part;
    if (missing == 0) {
        return;
    }
    builder_.interrupt(end);
    tell(fmt::format("{} of the run's files {} missing", missing, missing == 1 ? "is" : "are"),
         axis_.seconds() - end);
    for (const auto& before : line.at("before")) {
        builder_.takeOld(before.at("event").get<std::string>(), before, axis_.seconds());
    }
}

/// @param length of what ends now, seconds
void RecordingReader::tell(const std::string& text, double length) {
    builder_.recording().gaps.add({axis_.seconds() - length, length, text});
}

void RecordingReader::leaveOut(const std::string& problem) {
    const auto where = fmt::format("{}:{}: ", name_, lineNumber_);
    if (firstProblem_.empty()) {
        firstProblem_ = where + "this is no record of vantel-host: " + problem;
    }
    tell(where + "this line is no event: " + problem);
}

} // namespace vantelhost
