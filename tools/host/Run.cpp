#include "Run.h"

#include <cstdio>
#include <cstdlib>
#include <string_view>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

#include "EventPrinter.h"
#include "PlainPrinter.h"
#include "SessionKeeper.h"
#include "Settings.h"
#include "SettingsOptions.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

bool showsLive(const RunOptions& options) {
    const char* const kind = std::getenv("TERM");
    return !options.jsonLines && !options.plain && ::isatty(STDOUT_FILENO) == 1 &&
           kind != nullptr && std::string_view(kind) != "dumb";
}

/// Also where that cannot be written: nothing is thrown.
void complain(const std::string& text) {
    std::fputs(fmt::format("vantel-host: {}\n", onOneLine(text)).c_str(), stderr);
}

void onLostOutput(const std::string& reason) {
    complain("output: " + reason);
    Signals::requestStop();
}

} // namespace

Run::Run(const RunOptions& options, std::optional<std::string> configText, Signals& signals)
    : options_(options),
      configText_(std::move(configText)),
      signals_(signals),
      journal_(output(), onLostOutput, begin_) {
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
        using Detail = PlainPrinter::Detail;
        return PlainPrinter(STDOUT_FILENO, options_.quiet ? Detail::quiet : Detail::all);
    }
    view_.emplace(STDOUT_FILENO, begin_);
    return [this](const Event& event, const Moment& moment) { return view_->take(event, moment); };
}

int Run::execute() {
    const PlugIn plugIn(options_.pluginPath);
    journal_.note(loadedEvent(options_.pluginPath, plugIn.name(), plugIn.apiVersion()));
    Schema schema;
    if (journal_.isClean() && readSchema(plugIn, schema)) {
        keepSessions(plugIn, completedSettings(schema));
    } else {
        beginRecord();
    }
    if (chrony_) {
        journal_.note(chrony_->state());
    }
    tellFailure();
    journal_.summary();
    return journal_.tally().errors == healedErrors_ ? exitClean : exitFailed;
}

bool Run::readSchema(const PlugIn& plugIn, Schema& schema) {
    HostStatus status;
    const std::string text = plugIn.schema(status);
    if (!succeeded(journal_, "getParameterValidationData", status)) {
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

void Run::keepSessions(const PlugIn& plugIn, Json settings) {
    std::optional<EpochFifo> fifo;
    const bool terminalIsShared = view_ && ::isatty(STDERR_FILENO) == 1;
    SessionKeeper keeper({plugIn, options_, journal_, signals_, fifo,
                          terminalIsShared ? -1 : STDERR_FILENO, [this] { turn(); }},
                         std::move(settings));
    keeper.prepare();
    if (options_.useFifo) {
        fifo.emplace(options_.fifo,
                     options_.createFifo ? EpochFifo::Absent::create : EpochFifo::Absent::refuse);
    }
    beginRecord();
    // Nothing is begun when the output or the record is lost already.
    if (!journal_.isClean()) {
        return;
    }
    keeper.run();
    facts_ = keeper.facts();
    healedErrors_ = keeper.healedErrors();
    if (view_) {
        view_->close();
    }
    if (terminalIsShared) {
        for (const auto& line : keeper.lastWords()) {
            complain("ptp4l: " + line);
        }
    }
}

void Run::beginRecord() {
    if (record_) {
        record_->begin();
        journal_.addOutput("record " + options_.recordFile,
                           EventPrinter(record_->descriptor(), Format::jsonLines));
    }
    journal_.outputsAreComplete();
}

void Run::turn() {
    if (view_) {
        view_->refresh();
    }
}

void Run::tellFailure() {
    facts_.tally = journal_.tally();
    if (chrony_ && chrony_->tookNone()) {
        facts_.chronyFailure = chrony_->state().text;
    }
    if (const auto failure = failureOf(facts_)) {
        journal_.error(causeEvent(failure->cause));
        journal_.note(mendEvent(failure->mend));
    }
}

} // namespace vantelhost
