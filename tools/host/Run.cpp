#include "Run.h"

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <exception>
#include <string_view>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

#include "Settings.h"
#include "SettingsOptions.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

using Clock = StopSignal::Clock;

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

void complain(const std::string& text) {
    fmt::print(stderr, "vantel-host: {}\n", onOneLine(text));
}

} // namespace

Run::Run(const RunOptions& options, std::optional<std::string> configText,
         const StopSignal& stopSignal)
    : options_(options),
      configText_(std::move(configText)),
      stopSignal_(stopSignal),
      journal_(output(), StopSignal::request, begin_),
      callbacks_(journal_, options.refuseWhileStopping) {
    connectOutputs();
}

EventSink Run::output() {
    if (!showsLive(options_)) {
        return EventPrinter(STDOUT_FILENO,
                            options_.jsonLines ? Format::jsonLines : Format::readable);
    }
    view_.emplace(STDOUT_FILENO, begin_);
    return [this](const Event& event, const Moment& moment) { return view_->take(event, moment); };
}

void Run::connectOutputs() {
    if (!options_.recordFile.empty()) {
        record_.emplace(options_.recordFile);
        journal_.addOutput("record " + options_.recordFile,
                           EventPrinter(record_->descriptor(), Format::jsonLines));
    }
    if (!options_.chronySocket.empty()) {
        chrony_.emplace(options_.chronySocket);
        journal_.handPairsTo([this](std::uint64_t reference, std::uint64_t local) {
            return chrony_->take(reference, local);
        });
    }
}

int Run::execute() {
    session();
    if (chrony_) {
        journal_.note(chrony_->state());
    }
    journal_.summary();
    return journal_.isClean() ? exitClean : exitFailed;
}

void Run::session() {
    const PlugIn plugIn(options_.pluginPath);
    journal_.note(loadedEvent(options_.pluginPath, plugIn.name(), plugIn.apiVersion()));
    Schema schema;
    // Nothing is begun when the output or the record is lost already.
    if (!journal_.isClean() || !readSchema(plugIn, schema)) {
        return;
    }
    const Json settings = completedSettings(schema);
    openFifo();
    if (initialise(plugIn, settings)) {
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
    journal_.note(stoppedEvent());
    if (view_) {
        view_->close();
    }
}

std::string Run::startAndWait(const PlugIn& plugIn) {
    try {
        if (options_.epochOffset) {
            writeOffset(*options_.epochOffset);
        }
        HostStatus status;
        plugIn.start(callbacks_.slot(), status);
        if (!succeeded("start", status)) {
            return "start failed";
        }
        journal_.note(startedEvent());
        return waitForEnd();
    } catch (const std::exception& error) {
        journal_.error(failureEvent("run", error.what()));
        return "failure";
    }
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
        if (auto signal = stopSignal_.waitUntil(next)) {
            return signal;
        }
        if (deadline && Clock::now() >= *deadline) {
            return std::nullopt;
        }
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
