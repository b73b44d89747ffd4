/// @file
/// Sessions that are stopped while something is wrong.
#pragma once

#include <chrono>
#include <functional>
#include <string>
#include <vector>

#include <sys/types.h>

#include "SessionFixture.h"

class FaultTest : public SessionTest {
protected:
    FaultTest();

    /// Each test must have measured a stop.
    void TearDown() override;

    /// What may be under way when stop is called; stop may take the sum of it.
    struct UnderWay {
        int answers = 0;                       ///< still awaited in this poll, or sends: 2 s each
        bool watchdog = true;                  ///< a second
        std::chrono::milliseconds hostCall{0}; ///< the longest call of the host
        bool grace = false;                    ///< 10 s, for a daemon that has to be killed

        /// One after the other: what is promised.
        std::chrono::milliseconds sum() const;

        /// With the watchdog's second beside the answers and the host's calls, as it is.
        std::chrono::milliseconds atOnce() const;

    private:
        std::chrono::milliseconds second() const;
    };

    /// What the test itself runs beside the session: no leftovers of it.
    struct Helpers {
        int threads = 0;
        std::vector<pid_t> processes;
    };

    /// What the host is told.
    const QualityReport waiting{"Waiting for ptp4l status", false};
    const QualityReport usable{"PTP role has changed.", true};
    const QualityReport noRole{"PTP role has changed.", false};
    const QualityReport died{"PTP sub process has died unexpectedly", false};
    const QualityReport unreachable{
        "Unable to communicate with PTP sub process while attempting to retrieve time data", false};

    /// The line that a failed poll leaves in the log.
    static std::string failureLine(int code);

    /// Initialises and starts the session, and waits until the host has been told all about a
    /// first good poll. On a busy machine the daemon may miss an earlier one.
    void beginWell(const std::string& script = "gm present\n",
                   const std::string& interfaces = "[]");

    /// What the host has been told since then.
    std::vector<QualityReport> newQualities() const;
    std::vector<std::string> newMetaData() const;

    /// Waits until the host has been told of a failed poll since then, and expects that it was one
    /// with this code.
    void expectFailure(int code);

    /// Expects that polls succeed again, and that the host is told no new quality: see
    /// `silent-recovery` in docs/oddities.md.
    void expectSilentRecovery();

    /// The daemon that the session has started. Waits for it.
    static pid_t daemonPid();

    /// Waits until the plug-in begins to wait for an answer, after this call. So there is nearly
    /// all of its time left. @return false after the deadline.
    static bool waitUntilAnswerIsAwaited();

    /// Waits until the plug-in begins to send a request, after this call.
    /// @return false after the deadline.
    static bool waitUntilRequestIsSent();

    /// Stops the session, on this thread and with the fault in place, and finalises it. Expects
    /// that the row of this test promises the sum of what is under way, that stop takes no longer
    /// than that, with a second and a half for a busy machine and what it adds to the sleeps of the
    /// period of grace, that at most one poll ends meanwhile, and that neither thread nor child is
    /// left. Prints what stop took and the sum, with what sleeps have been late:
    /// "[ STOP ] Suite.Name: 1.234 s of at most 3.0 s + 0.0 s late". A stop that hangs ends the
    /// program.
    void expectStopWithin(const UnderWay& underWay);

    /// @param stop stops the session; may finalise it, too.
    void expectStopWithin(const UnderWay& underWay, const std::function<void()>& stop);

    Helpers helpers;

private:
    /// Of all that the host was told, its first good poll included.
    std::size_t qualitiesBefore_ = 0;
    std::size_t metaDataBefore_ = 0;

    const std::string promised_;
    bool hasMeasured_ = false;

    void waitForFirstGoodPoll();

    /// Good ones, and those that failed.
    int endedPolls() const;
    void expectNothingLeft(bool killed) const;
};
