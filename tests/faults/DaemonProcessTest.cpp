// A daemon that cannot be run, does not run any more, or does not end.

#include <algorithm>
#include <csignal>
#include <filesystem>

#include <gmock/gmock.h>
#include <syslog.h>

#include "FaultTest.h"
#include "Interposed.h"

namespace {

using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class DaemonProcessTest : public FaultTest {
protected:
    /// Waits for the report of the watchdog, and for its end.
    void expectDeathIsReported() {
        ASSERT_TRUE(waitUntil([this] { return !deaths().empty(); }));
        expectOwnThreads(1);
        EXPECT_THAT(deaths(), SizeIs(1));
        ASSERT_TRUE(waitForLog(failureLine(-52024), 2)); // The first is reported by then.
        EXPECT_THAT(qualities(), Contains(unreachable));
        EXPECT_EQ(metaData().back(), defaultMetaData);
    }

    std::vector<QualityReport> deaths() const {
        std::vector<QualityReport> chosen;
        for (const auto& report : qualities()) {
            if (report == died) {
                chosen.push_back(report);
            }
        }
        return chosen;
    }

    /// Expects that the daemon was asked to end, and then killed, and that the log says so.
    void expectKilled(pid_t child) const {
        EXPECT_THAT(sentSignals(),
                    ElementsAre(SentSignal{child, SIGTERM}, SentSignal{child, SIGKILL}));
        const SyslogCapture::Line line{LOG_ERR, "Killing ptp4l subprocess (pid " +
                                                    std::to_string(child) + ") using SIGKILL.x"};
        EXPECT_EQ(log.lines().back(), line);
    }
};

TEST_F(DaemonProcessTest, ThatIgnoresSigtermIsKilledAfterTenSeconds) {
    beginWell("ignore SIGTERM\n");
    const auto begun = std::chrono::steady_clock::now();
    expectStopWithin({0, true, {}, true});
    EXPECT_GE(std::chrono::steady_clock::now() - begun, std::chrono::seconds(10));
    expectKilled(daemonPid());
    EXPECT_THAT(SimulatedDaemon::events("signal"), SizeIs(1));
    EXPECT_THAT(newQualities(), IsEmpty());
}

// SIGTERM waits until the daemon goes on, SIGKILL does not.
TEST_F(DaemonProcessTest, ThatIsStoppedIsUnreachableAndKilledAfterTenSeconds) {
    beginWell();
    ASSERT_EQ(kill(daemonPid(), SIGSTOP), 0);
    forgetSentSignals();
    expectFailure(-52007);
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectStopWithin({1, true, {}, true});
    expectKilled(daemonPid());
}

TEST_F(DaemonProcessTest, ThatReadsNothingHoldsUpTheSendWhenItsQueueIsFull) {
    beginWell("on any after 6 do stop-reading 1000\n");
    expectFailure(-52007);
    DatagramSocket().fillQueueOf("ptp4l.sock");
    ASSERT_TRUE(waitUntilRequestIsSent());
    expectStopWithin({1});
    EXPECT_GE(log.count(failureLine(-52024)), 1);
    EXPECT_THAT(newQualities(), Each(unreachable));
    EXPECT_THAT(SimulatedDaemon::events("exit"), SizeIs(1));
}

TEST_F(DaemonProcessTest, ThatSomebodyKillsIsReportedOnce) {
    beginWell();
    ASSERT_EQ(kill(daemonPid(), SIGKILL), 0);
    forgetSentSignals();
    expectDeathIsReported();
    expectStopWithin({});
    EXPECT_THAT(deaths(), SizeIs(1));
    EXPECT_THAT(sentSignals(), IsEmpty());
}

TEST_F(DaemonProcessTest, ThatCannotBeExecutedIsReportedByTheWatchdog) {
    std::filesystem::remove("ptp4l");
    begin("");
    EXPECT_EQ(log.lines().at(0).text, std::string("update Meta Data: ") + defaultMetaData);
    expectDeathIsReported();
    EXPECT_THAT(metaData(), Each(defaultMetaData));
    EXPECT_EQ(log.count("Unable to spawn off ptp4l"), 0);
    expectStopWithin({});
    EXPECT_THAT(deaths(), SizeIs(1));
    EXPECT_THAT(sentSignals(), IsEmpty());
}

// Somebody else's daemon is as good: the host gets its data, but the quality stays.
TEST_F(DaemonProcessTest, ThatSomebodyElseRestartsIsHeardAgain) {
    beginWell();
    ASSERT_EQ(kill(daemonPid(), SIGKILL), 0);
    forgetSentSignals();
    expectDeathIsReported();
    std::filesystem::remove("ptp4l.sock");
    helpers.threads = 1;
    answers = std::make_unique<FakePtp4l>("ptp4l.sock",
                                          std::vector<FakePtp4l::Measurement>{{5, 1000, 1}});
    const auto hasNewPair = [](const RecordingHost::Call& call) { return call.localTime == 1000; };
    ASSERT_TRUE(host.waitFor(
        [=](const Calls& calls) { return std::any_of(calls.begin(), calls.end(), hasNewPair); }));
    EXPECT_EQ(host.calls(Function::adjustTime).back().referenceTime, 995U);
    EXPECT_FALSE(qualities().back().usable);
    expectStopWithin({});
    EXPECT_THAT(deaths(), SizeIs(1));
    EXPECT_THAT(sentSignals(), IsEmpty());
}

} // namespace
