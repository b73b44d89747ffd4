/// @file
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <string>

#include "Clock/LocalTime.h"
#include "EpochFifo.h"
#include "Failure.h"
#include "Journal.h"
#include "Json.h"
#include "Moment.h"
#include "PlugIn.h"
#include "RestartDelay.h"
#include "RunOptions.h"
#include "ServiceManager.h"
#include "Session.h"
#include "Signals.h"

namespace vantelhost {

/// Keeps a session of the plug-in at work until a signal, the end of the time or, without
/// --restart, the end of ptp4l ends the run; with it, one session after the other. New settings,
/// too, get a session of their own. Single use.
class SessionKeeper {
public:
    struct Surroundings {
        const PlugIn& plugIn;
        const RunOptions& options;
        Journal& journal;
        Signals& signals;
        LocalTime& localTime;           ///< each session chooses its clock
        std::optional<EpochFifo>& fifo; ///< there when this host writes epoch offsets
        int passWordsOn;                ///< as LastWords has it
        std::function<void()> onTurn;   ///< called several times a second, by the same thread

        /// Reads the configuration again, and gets the settings in use.
        /// @return others, if there are some and they may be used; may throw UsageError.
        std::function<std::optional<Json>(const Json& settings)> reread;
    };

    SessionKeeper(Surroundings surroundings, Json settings);

    /// Makes ready what the plug-in needs before it gets the settings. Throws UsageError.
    void prepare();

    void run();

    /// Of the last session.
    const RunFacts& facts() const { return facts_; }

    /// How many of the journal's errors a restart has put behind.
    std::uint64_t healedErrors() const { return healedErrors_; }

    /// The last lines of the last session's ptp4l, when it did not end unasked.
    const std::deque<std::string>& lastWords() const { return lastWords_; }

private:
    using TimePoint = Moment::Clock::time_point;

    /// How a session ends.
    struct End {
        std::string cause;
        bool isRestart;
        bool isFailure = true; ///< of a session; restarts then take their time
    };

    End session();
    End startAndAttend();

    /// Prepares the next session.
    /// @return false when the run ends instead.
    bool restart(const End& end);

    /// @return how the session ends; nothing when the time has come.
    std::optional<End> attend(std::optional<TimePoint> until = std::nullopt);
    TimePoint nextTurn(std::optional<TimePoint> until) const;

    /// When --seconds are over; nothing without them, or before they begin.
    std::optional<TimePoint> endTime() const;
    void turn();

    /// What the health asks for.
    std::optional<End> reasonToEnd();

    /// @return the name of a signal that ends the run.
    std::optional<std::string> takeNews();

    /// Reads the configuration again when that is asked for.
    /// @return the end of a session whose settings are other ones now.
    std::optional<End> reread();

    End initialiseFailed();

    /// How a session ends that failed. With new settings that ptp4l has not answered with, those
    /// before are back.
    End failed(const std::string& cause);
    void noteFacts();
    void writeDueOffsets();
    void writeOffset(std::int64_t nanoseconds);

    const Surroundings with_;
    Json settings_;
    std::optional<Json> settingsBefore_; ///< until ptp4l has answered with those that are new
    std::uint64_t pollsBefore_ = 0;      ///< good ones, before this session
    bool rereadIsDue_ = false;
    ServiceManager manager_;
    RestartDelay delay_;
    RunFacts facts_;
    std::optional<Session> session_;
    std::optional<TimePoint> begin_;          ///< of the first session; nothing before
    std::optional<std::int64_t> epochOffset_; ///< the last one that was written, or is to be
    std::size_t offsetsWritten_ = 0;          ///< of the timed ones
    std::uint64_t restarts_ = 0;
    std::uint64_t healedErrors_ = 0;
    std::deque<std::string> lastWords_;
};

} // namespace vantelhost
