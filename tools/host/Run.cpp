#include "Run.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string_view>
#include <utility>

#include <fmt/format.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Checks/DaemonChecks.h"
#include "PlainPrinter.h"
#include "Preparations.h"
#include "Settings.h"
#include "SettingsOptions.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

using Clock = Moment::Clock;

/// With which a child of the plug-in ends that did not become ptp4l, without a word.
constexpr int notExecuted = 255;

/// How long the live view may stand still.
constexpr std::chrono::milliseconds refreshTime(500);

bool showsLive(const RunOptions& options) {
    const char* const kind = std::getenv("TERM");
    return !options.jsonLines && !options.plain && ::isatty(STDOUT_FILENO) == 1 &&
           kind != nullptr && std::string_view(kind) != "dumb";
}

Clock::time_point after(Clock::time_point begin, double seconds) {
    return begin +
           std::chrono::duration_cast<Clock::duration>(std::chrono::duration<double>(seconds));
}

/// Also where that cannot be written: nothing is thrown.
void complain(const std::string& text) {
    std::fputs(fmt::format("vantel-host: {}\n", onOneLine(text)).c_str(), stderr);
}

void onLostOutput(const std::string& reason) {
    complain("output: " + reason);
    Signals::requestStop();
}

/// Until there is something to read, or the deadline; for ever without one.
void waitForInput(std::array<int, 2> descriptors, std::optional<Clock::time_point> deadline) {
    // Rounded up, lest it ends in many short waits; and not longer than an int is large.
    constexpr std::chrono::milliseconds longest = std::chrono::hours(1);
    int milliseconds = -1;
    if (deadline) {
        const auto left = std::chrono::ceil<std::chrono::milliseconds>(*deadline - Clock::now());
        milliseconds = static_cast<int>(std::clamp(left, longest * 0, longest).count());
    }
    std::array<pollfd, 2> inputs{{{descriptors[0], POLLIN, 0}, {descriptors[1], POLLIN, 0}}};
    ::poll(inputs.data(), inputs.size(), milliseconds);
}

bool isThere(const std::string& path) {
    struct stat state {};
    return ::stat(path.c_str(), &state) == 0;
}

} // namespace

Run::Run(const RunOptions& options, std::optional<std::string> configText, Signals& signals)
    : options_(options),
      configText_(std::move(configText)),
      signals_(signals),
      journal_(output(), onLostOutput, begin_),
      callbacks_(journal_, options.refuseWhileStopping, [this] { return signals_.stopHasCome(); }),
      words_(view_ && ::isatty(STDERR_FILENO) == 1 ? -1 : STDERR_FILENO) {
    if (!options_.recordFile.empty()) {
        record_.emplace(options_.recordFile);
    }
    if (!options_.chronySocket.empty()) {
        chrony_.emplace(options_.chronySocket);
        journal_.handPairsTo([this](std::uint64_t reference, std::uint64_t local) {
            return chrony_->take(reference, local);
        });
    }
}

EventSink Run::output() {
    if (options_.jsonLines) {
        return EventPrinter(STDOUT_FILENO, Format::jsonLines);
    }
    if (!showsLive(options_)) {
        return PlainPrinter(STDOUT_FILENO);
    }
    view_.emplace(STDOUT_FILENO, begin_);
    return [this](const Event& event, const Moment& moment) { return view_->take(event, moment); };
}

int Run::execute() {
    session();
    if (chrony_) {
        journal_.note(chrony_->state());
    }
    tellFailure();
    journal_.summary();
    return journal_.isClean() ? exitClean : exitFailed;
}

void Run::session() {
    const PlugIn plugIn(options_.pluginPath);
    journal_.note(loadedEvent(options_.pluginPath, plugIn.name(), plugIn.apiVersion()));
    Schema schema;
    if (!journal_.isClean() || !readSchema(plugIn, schema)) {
        beginRecord();
        return;
    }
    const Json settings = completedSettings(schema);
    prepare(settings);
    openFifo();
    beginRecord();
    // Nothing is begun when the output or the record is lost already.
    if (journal_.isClean() && initialise(plugIn, settings)) {
        startAndStop(plugIn);
        plugIn.finalise(callbacks_.slot());
    }
    fifo_.reset();
}

bool Run::readSchema(const PlugIn& plugIn, Schema& schema) {
    HostStatus status;
    const std::string text = plugIn.schema(status);
    if (!succeeded("getParameterValidationData", status)) {
        return false;
    }
    try {
        schema = parseSchema(text);
        return true;
    } catch (const SchemaError& error) {
        journal_.error(failureEvent("getParameterValidationData", error.what()));
        return false;
    }
}

Json Run::completedSettings(const Schema& schema) const {
    const Settings settings = completeSettings(schema, userSettings(options_, configText_));
    for (const auto& warning : settings.warnings) {
        complain("warning: " + warning);
    }
    for (const auto& error : settings.errors) {
        complain(error);
    }
    if (!settings.errors.empty()) {
        throw UsageError("the plug-in is not started with bad settings");
    }
    return settings.values;
}

void Run::prepare(const Json& settings) {
    if (!options_.force) {
        refuseSocketInUse(settings);
    }
    if (const auto folder = makeConfigFolder(settings)) {
        journal_.note(folderEvent(*folder));
    }
    facts_.patience = patienceFor(settings);
}

void Run::beginRecord() {
    if (record_) {
        record_->begin();
        journal_.addOutput("record " + options_.recordFile,
                           EventPrinter(record_->descriptor(), Format::jsonLines));
    }
    journal_.outputsAreComplete();
}

bool Run::initialise(const PlugIn& plugIn, const Json& settings) {
    HostStatus status;
    plugIn.initialise(callbacks_.slot(), settings.dump(), status);
    if (!succeeded("initialize", status)) {
        return false;
    }
    journal_.note(initialisedEvent(settings));
    return true;
}

void Run::startAndStop(const PlugIn& plugIn) {
    if (view_) {
        view_->open();
    }
    // Also stopped after a start that failed: whatever that left running ends here, or finalise
    // could wait for it for ever.
    journal_.note(stoppingEvent(startAndWait(plugIn)));
    callbacks_.stoppingBegins();
    plugIn.stop(callbacks_.slot());
    words_.take();
    journal_.note(stoppedEvent());
    if (view_) {
        view_->close();
        tellLastWords();
    }
}

void Run::tellLastWords() {
    if (!words_.arePassedOn() && facts_.daemonEnd.empty()) {
        for (const auto& line : words_.lines()) {
            complain("ptp4l: " + line);
        }
    }
}

std::string Run::startAndWait(const PlugIn& plugIn) {
    try {
        if (options_.epochOffset) {
            writeOffset(*options_.epochOffset);
        }
        if (!start(plugIn)) {
            return "start failed";
        }
        const auto begin = Clock::now();
        journal_.note(startedEvent());
        std::string cause = waitForEnd();
        facts_.seconds = std::chrono::duration<double>(Clock::now() - begin).count();
        facts_.fifoIsThere = isThere(options_.fifo);
        return cause;
    } catch (const std::exception& error) {
        journal_.error(failureEvent("run", error.what()));
        return "failure";
    }
}

bool Run::start(const PlugIn& plugIn) {
    HostStatus status;
    {
        const LastWords::Redirection redirection(words_);
        plugIn.start(callbacks_.slot(), status);
    }
    return succeeded("start", status);
}

std::string Run::waitForEnd() {
    const auto begin = Clock::now();
    for (const auto& offset : options_.timedOffsets) {
        if (options_.seconds && offset.seconds > *options_.seconds) {
            break;
        }
        if (const auto signal = waitUntil(after(begin, offset.seconds))) {
            return *signal;
        }
        writeOffset(offset.nanoseconds);
    }
    std::optional<Clock::time_point> end;
    if (options_.seconds) {
        end = after(begin, *options_.seconds);
    }
    return waitUntil(end).value_or("duration");
}

std::optional<std::string> Run::waitUntil(std::optional<Clock::time_point> deadline) {
    for (;;) {
        auto next = deadline;
        if (view_) {
            view_->refresh();
            const auto soon = Clock::now() + refreshTime;
            next = deadline ? std::min(*deadline, soon) : soon;
        }
        waitForInput({signals_.descriptor(), words_.descriptor()}, next);
        if (auto signal = takeNews()) {
            return signal;
        }
        if (deadline && Clock::now() >= *deadline) {
            return std::nullopt;
        }
    }
}

std::optional<std::string> Run::takeNews() {
    words_.take();
    while (const auto news = signals_.take()) {
        if (!news->stop.empty()) {
            return news->stop;
        }
        if (news->childEnd) {
            tellDaemonEnd(*news->childEnd);
        }
    }
    return std::nullopt;
}

void Run::tellDaemonEnd(const ChildEnd& end) {
    words_.take();
    const Event event = daemonEndedEvent(end, words_.lines());
    journal_.note(event);
    if (!facts_.daemonEnd.empty()) {
        return;
    }
    facts_.daemonEnd = event.text;
    if (end.bySignal || end.status != notExecuted || !words_.lines().empty()) {
        return;
    }
    // Only of the library that was built with this program the path is known.
    const Finding daemon = checkDaemon(Subject());
    if (options_.pluginPath == RunOptions().pluginPath && daemon.verdict == Verdict::fail) {
        facts_.daemonEnd += ": " + daemon.found;
        facts_.daemonMend = daemon.mend;
    }
}

void Run::tellFailure() {
    facts_.tally = journal_.tally();
    facts_.fifo = options_.fifo;
    if (chrony_ && chrony_->tookNone()) {
        facts_.chronyFailure = chrony_->state().text;
    }
    if (const auto failure = failureOf(facts_)) {
        journal_.error(causeEvent(failure->cause));
        journal_.note(mendEvent(failure->mend));
    }
}

void Run::openFifo() {
    if (options_.useFifo) {
        fifo_.emplace(options_.fifo,
                      options_.createFifo ? EpochFifo::Absent::create : EpochFifo::Absent::refuse);
    }
}

void Run::writeOffset(std::int64_t nanoseconds) {
    try {
        fifo_->write(nanoseconds);
        journal_.note(epochOffsetEvent(nanoseconds));
    } catch (const std::system_error& error) {
        journal_.error(failureEvent("epoch offset", error.what()));
    }
}

bool Run::succeeded(const char* operation, const HostStatus& status) {
    if (status.isError()) {
        journal_.error(statusEvent(operation, status.code(), status.text()));
    } else if (status.isWarning()) {
        journal_.note(statusEvent(operation, status.code(), status.text()));
    }
    return !status.isError();
}

} // namespace vantelhost
