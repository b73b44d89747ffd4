#include "Run.h"

#include <cstdio>
#include <cstdlib>
#include <string_view>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

#include "EventPrinter.h"
#include "PlainPrinter.h"
#include "Preparations.h"
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

} // namespace

Run::Run(const RunOptions& options, std::optional<std::string> configText, Signals& signals,
         Reread reread)
    : options_(options),
      configText_(std::move(configText)),
      signals_(signals),
      reread_(std::move(reread)),
      journal_(
          output(), [this](const std::string& reason) { loseOutput(reason); }, begin_),
      localTime_(options_.clock, !options_.chronySocket.empty(),
                 [this](const Event& event) { journal_.error(event); }) {
    journal_.carryPairsBy([this](std::uint64_t local) { return localTime_.carry(local); });
    if (!options_.recordFile.empty()) {
        record_.emplace(options_.recordFile, options_.recordRules);
    }
    if (!options_.chronySocket.empty()) {
        chrony_.emplace(options_.chronySocket, TaiOffset(options_.taiOffset));
        journal_.handPairsTo([this](std::uint64_t reference, std::uint64_t local) {
            return handToChrony(reference, local);
        });
    }
    if (!options_.statusSocket.empty()) {
        statusPage_.emplace();
        statusSocket_.emplace(options_.statusSocket, [this] {
            return toAscii(statusPage_->at(Moment::now(begin_).seconds)) + "\n";
        });
    }
    if (options_.metrics) {
        metrics_.emplace(*options_.metrics, begin_);
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

std::optional<Event> Run::handToChrony(std::uint64_t reference, std::uint64_t local) {
    auto news = chrony_->take(
        reference, local, localTime_.isRealtime() ? StampedBy::systemClock : StampedBy::ptpClock);
    const ChronyCounts& counts = chrony_->clock().counts();
    if (metrics_) {
        metrics_->takeChrony(counts);
    }
    if (statusPage_) {
        statusPage_->takeChrony(counts);
    }
    return news;
}

int Run::execute() {
    const PlugIn plugIn(options_.pluginPath);
    journal_.note(loadedEvent(options_.pluginPath, plugIn.name(), plugIn.apiVersion()));
    Schema schema;
    if (journal_.isClean() && readSchema(plugIn, schema)) {
        keepSessions(plugIn, schema);
    } else {
        beginOutputs();
    }
    tell(localTime_.state());
    if (chrony_) {
        journal_.note(chrony_->clock().state());
    }
    tellFailure();
    journal_.summary();
    return endsWell() ? exitClean : exitFailed;
}

bool Run::endsWell() const {
    // Whoever runs it for months has seen how it stood, and asks for nothing but its end.
    const bool isAskedToEnd = options_.restart && signals_.stopHasCome() && !outputIsLost_;
    return isAskedToEnd || journal_.tally().errors == healedErrors_;
}

void Run::loseOutput(const std::string& reason) {
    outputIsLost_ = true;
    complain("output: " + reason);
    Signals::requestStop();
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

std::optional<Json> Run::newSettings(const Schema& schema, const Json& settings) {
    ConfigChange change = reread_(schema, settings);
    if (change.settings) {
        try {
            const auto folder = prepareChange(*change.settings, settings, options_.force);
            if (folder) {
                journal_.note(folderEvent(*folder));
            }
        } catch (const UsageError& error) {
            change = {{error.what()}, {}, std::nullopt, {}};
        }
    }
    for (const auto& warning : change.warnings) {
        complain("warning: " + warning);
    }
    journal_.note(rereadEvent(change));
    return change.settings;
}

void Run::keepSessions(const PlugIn& plugIn, const Schema& schema) {
    std::optional<EpochFifo> fifo;
    const bool terminalIsShared = view_ && ::isatty(STDERR_FILENO) == 1;
    SessionKeeper keeper({plugIn, options_, journal_, signals_, localTime_, fifo,
                          terminalIsShared ? -1 : STDERR_FILENO, [this] { turn(); },
                          [&](const Json& inUse) { return newSettings(schema, inUse); }},
                         completedSettings(schema));
    keeper.prepare();
    if (options_.useFifo) {
        fifo.emplace(options_.fifo,
                     options_.createFifo ? EpochFifo::Absent::create : EpochFifo::Absent::refuse,
                     options_.writesFifo() ? EpochFifo::Use::write : EpochFifo::Use::hold);
    }
    beginOutputs();
    if (outputIsLost_) {
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

void Run::beginOutputs() {
    journal_.addOutput([this](const Event& event, const Moment& /*moment*/) {
        localTime_.take(event);
        return std::nullopt;
    });
    if (record_) {
        record_->begin();
        journal_.addOutput([this](const Event& event, const Moment& moment) {
            return record_->take(event, moment);
        });
    }
    if (statusPage_) {
        journal_.addOutput([this](const Event& event, const Moment& moment) {
            statusPage_->take(event, moment);
            return std::nullopt;
        });
    }
    if (metrics_) {
        journal_.addOutput([this](const Event& event, const Moment& moment) {
            metrics_->take(event, moment);
            return std::nullopt;
        });
    }
    journal_.outputsAreComplete();
    attend();
}

void Run::attend() {
    if (metrics_) {
        tell(metrics_->attend());
    }
    if (statusSocket_) {
        tell(statusSocket_->attend());
    }
}

void Run::tell(const std::optional<Event>& news) {
    if (news) {
        journal_.note(*news);
    }
}

void Run::turn() {
    if (view_) {
        view_->refresh();
    }
    attend();
}

void Run::tellFailure() {
    facts_.tally = journal_.tally();
    if (chrony_ && chrony_->clock().tookNone()) {
        facts_.chronyFailure = chrony_->clock().state().text;
    }
    if (const auto failure = failureOf(facts_)) {
        journal_.error(causeEvent(failure->cause));
        journal_.note(mendEvent(failure->mend));
    }
}

} // namespace vantelhost
