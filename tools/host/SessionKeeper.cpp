#include "SessionKeeper.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <exception>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <poll.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include "Checks/DaemonChecks.h"
#include "Preparations.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

using Clock = Moment::Clock;

/// How often what depends on time alone is looked at.
constexpr std::chrono::milliseconds turnTime(250);

/// How long the plug-in's worker may be silent, in seconds: a poll that fails takes 2 s for each
/// answer that does not come, and is told.
constexpr double longestSilence = 10;

/// After so many seconds locked the next restart comes soon again.
constexpr double goodTime = 600;

Clock::time_point after(Clock::time_point begin, double seconds) {
    return begin +
           std::chrono::duration_cast<Clock::duration>(std::chrono::duration<double>(seconds));
}

/// Until there is something to read, or the deadline.
void waitForInput(int one, int other, Clock::time_point deadline) {
    // Rounded up, lest it ends in many short waits.
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - Clock::now());
    std::array<pollfd, 2> inputs{{{one, POLLIN, 0}, {other, POLLIN, 0}}};
    ::poll(inputs.data(), inputs.size(), static_cast<int>(std::max(left, left * 0).count()));
}

/// A ptp4l that the plug-in had to kill is not waited for by it: one that ends late would be taken
/// for the next session's, and stay a zombie.
void awaitChildren() {
    const auto deadline = Clock::now() + std::chrono::seconds(1);
    for (pid_t ended = 0; (ended = ::waitpid(-1, nullptr, WNOHANG)) >= 0;) {
        if (ended == 0 && Clock::now() >= deadline) {
            return;
        }
        if (ended == 0) {
            ::poll(nullptr, 0, 10);
        }
    }
}

bool isThere(const std::string& path) {
    struct stat state {};
    return ::stat(path.c_str(), &state) == 0;
}

} // namespace

SessionKeeper::SessionKeeper(Surroundings surroundings, Json settings)
    : with_(std::move(surroundings)),
      settings_(std::move(settings)),
      epochOffset_(with_.options.epochOffset) {}

void SessionKeeper::prepare() {
    if (!with_.options.force) {
        refuseSocketInUse(settings_);
    }
    if (const auto folder = makeConfigFolder(settings_)) {
        with_.journal.note(folderEvent(*folder));
    }
}

void SessionKeeper::run() {
    End end = session();
    while (end.isRestart && restart(end)) {
        end = session();
    }
    if (begin_) {
        facts_.seconds = std::chrono::duration<double>(Clock::now() - *begin_).count();
    }
    facts_.patience = patienceFor(settings_);
    facts_.fifo = with_.options.fifo;
}

SessionKeeper::End SessionKeeper::session() {
    facts_.daemonEnd.clear();
    facts_.daemonMend.clear();
    pollsBefore_ = with_.journal.tally().timeRequests;
    try {
        if (restarts_ > 0) {
            prepare();
        }
        session_.reset();
        if (const auto news = with_.localTime.choose(settings_)) {
            with_.journal.note(*news);
        }
        session_.emplace(with_.plugIn, with_.journal,
                         Session::Manner{with_.options.refuseWhileStopping,
                                         [this] { return with_.signals.stopHasCome(); },
                                         with_.passWordsOn,
                                         [this] { return with_.localTime.now(); }});
        if (!session_->initialise(settings_)) {
            return initialiseFailed();
        }
        End end = startAndAttend();
        session_->stop(end.isRestart ? restartCause : end.cause);
        noteFacts();
        return end;
    } catch (const std::exception& error) {
        with_.journal.error(failureEvent("run", error.what()));
        // The plug-in's child must be stopped whatever happens.
        if (session_) {
            session_->stop(with_.options.restart ? restartCause : "failure");
        }
        return failed(error.what());
    }
}

SessionKeeper::End SessionKeeper::startAndAttend() {
    // The FIFO's last value went to the last session.
    if (epochOffset_) {
        writeOffset(*epochOffset_);
    }
    if (!session_->start()) {
        return failed("start failed");
    }
    if (!begin_) {
        begin_ = Clock::now();
        manager_.isReady();
    }
    End end = *attend();
    if (!end.isRestart) {
        manager_.isStopping();
    }
    return end;
}

bool SessionKeeper::restart(const End& end) {
    session_.reset();
    awaitChildren();
    healedErrors_ = with_.journal.tally().errors;
    const double seconds = end.isFailure ? delay_.next() : 0;
    with_.journal.note(restartEvent(end.cause, seconds, ++restarts_));
    const auto runEnd = attend(after(Clock::now(), seconds));
    if (runEnd) {
        with_.journal.note(stoppingEvent(runEnd->cause));
    }
    return !runEnd;
}

std::optional<SessionKeeper::End> SessionKeeper::attend(std::optional<TimePoint> until) {
    for (;;) {
        waitForInput(with_.signals.descriptor(), session_ ? session_->words().descriptor() : -1,
                     nextTurn(until));
        if (auto signal = takeNews()) {
            return End{std::move(*signal), false};
        }
        if (auto end = reread()) {
            return end;
        }
        writeDueOffsets();
        if (const auto end = endTime(); end && Clock::now() >= *end) {
            return End{"duration", false};
        }
        turn();
        if (until && Clock::now() >= *until) {
            return std::nullopt;
        }
        if (auto end = reasonToEnd()) {
            return end;
        }
    }
}

SessionKeeper::TimePoint SessionKeeper::nextTurn(std::optional<TimePoint> until) const {
    TimePoint next = Clock::now() + turnTime;
    const auto& offsets = with_.options.timedOffsets;
    if (begin_ && offsetsWritten_ < offsets.size()) {
        next = std::min(next, after(*begin_, offsets[offsetsWritten_].seconds));
    }
    return std::min({next, until.value_or(next), endTime().value_or(next)});
}

std::optional<SessionKeeper::TimePoint> SessionKeeper::endTime() const {
    if (!begin_ || !with_.options.seconds) {
        return std::nullopt;
    }
    return after(*begin_, *with_.options.seconds);
}

void SessionKeeper::turn() {
    with_.journal.turn();
    with_.onTurn();
    // ptp4l has answered: it has taken the new settings.
    if (with_.journal.tally().timeRequests > pollsBefore_) {
        settingsBefore_.reset();
    }
    const Standing standing = with_.journal.health();
    if (standing.health.state == HealthState::locked && standing.seconds >= goodTime) {
        delay_.reset();
    }
    manager_.status(fmt::format("{}: {}", nameOf(standing.health.state), standing.health.reason));
    if (!session_ || with_.journal.sinceLastCall() < longestSilence) {
        manager_.feedWatchdog();
    }
}

std::optional<SessionKeeper::End> SessionKeeper::reasonToEnd() {
    if (!session_) {
        return std::nullopt;
    }
    const auto& [health, seconds] = with_.journal.health();
    if (health.state == HealthState::dead) {
        return failed(health.reason);
    }
    const double patience = with_.options.giveUpAfter;
    if (with_.options.restart && patience > 0 && health.state == HealthState::lost &&
        seconds >= patience) {
        return failed(fmt::format("lost for {:.0f} s: {}", seconds, health.reason));
    }
    return std::nullopt;
}

std::optional<std::string> SessionKeeper::takeNews() {
    if (session_) {
        session_->words().take();
    }
    while (const auto news = with_.signals.take()) {
        if (!news->stop.empty()) {
            return news->stop;
        }
        rereadIsDue_ = rereadIsDue_ || news->reread;
        // Without a session it is the one that was stopped.
        if (news->childEnd && session_) {
            session_->take(*news->childEnd);
        }
    }
    return std::nullopt;
}

std::optional<SessionKeeper::End> SessionKeeper::reread() {
    if (!std::exchange(rereadIsDue_, false)) {
        return std::nullopt;
    }
    auto settings = with_.reread(settings_);
    if (!settings) {
        return std::nullopt;
    }
    // The plug-in has taken the oldest ones.
    auto before = std::exchange(settings_, std::move(*settings));
    if (!settingsBefore_) {
        settingsBefore_ = std::move(before);
    }
    return session_ ? std::optional(End{"new settings", true, false}) : std::nullopt;
}

SessionKeeper::End SessionKeeper::initialiseFailed() {
    // At the very first there is nothing that a new session could heal.
    if (restarts_ == 0) {
        return {"initialise failed", false};
    }
    return failed("initialise failed");
}

SessionKeeper::End SessionKeeper::failed(const std::string& cause) {
    if (!settingsBefore_) {
        return {cause, with_.options.restart};
    }
    settings_ = std::move(*settingsBefore_);
    settingsBefore_.reset();
    return {cause + ": back to the settings before", true, false};
}

void SessionKeeper::noteFacts() {
    facts_.daemonEnd = session_->daemonEnd();
    facts_.fifoIsThere = isThere(with_.options.fifo);
    lastWords_ = facts_.daemonEnd.empty() ? session_->words().lines() : std::deque<std::string>();
    if (!session_->daemonWasNotExecuted()) {
        return;
    }
    // Only of the library that was built with this program the path is known.
    const Finding daemon = checkDaemon(Subject());
    if (with_.options.pluginPath == RunOptions().pluginPath && daemon.verdict == Verdict::fail) {
        facts_.daemonEnd += ": " + daemon.found;
        facts_.daemonMend = daemon.mend;
    }
}

void SessionKeeper::writeDueOffsets() {
    const auto& offsets = with_.options.timedOffsets;
    while (begin_ && offsetsWritten_ < offsets.size() &&
           Clock::now() >= after(*begin_, offsets[offsetsWritten_].seconds)) {
        epochOffset_ = offsets[offsetsWritten_++].nanoseconds;
        writeOffset(*epochOffset_);
    }
}

void SessionKeeper::writeOffset(std::int64_t nanoseconds) {
    try {
        with_.fifo->write(nanoseconds);
        with_.journal.note(epochOffsetEvent(nanoseconds));
    } catch (const std::system_error& error) {
        with_.journal.error(failureEvent("epoch offset", error.what()));
    }
}

} // namespace vantelhost
