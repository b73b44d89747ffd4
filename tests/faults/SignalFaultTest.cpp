// A host that gets signals, in any of its threads.

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <memory>

#include <gmock/gmock.h>
#include <syslog.h>
#include <unistd.h>

#include "FaultTest.h"
#include "Interposed.h"
#include "SignalRain.h"
#include "support/DatagramSocket.h"

namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;
using std::chrono::steady_clock;
using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::Not;
using testing::SizeIs;

class SignalFaultTest : public FaultTest {
protected:
    /// Begins, and finds the worker and the watchdog.
    void beginAndFindThreads(const std::string& script) {
        const auto before = threadIds();
        begin(script);
        for (const pid_t thread : threadIds()) {
            if (before.count(thread) == 0) {
                threads.push_back(thread);
            }
        }
        ASSERT_THAT(threads, SizeIs(2));
    }

    /// Interrupts the threads in what they do. Expects that the present poll fails at once, long
    /// before its 2 s are over, and no other.
    void expectOneFailure(int code) {
        const int before = log.count(failureLine(code));
        const auto begun = steady_clock::now();
        for (const pid_t thread : threads) {
            ASSERT_TRUE(interrupt(thread));
        }
        ASSERT_TRUE(waitForLog(failureLine(code), before + 1));
        EXPECT_LT(steady_clock::now() - begun, milliseconds(1500));
    }

    void expectNothingWorseThanFailures() const {
        EXPECT_THAT(qualities(), Not(Contains(died)));
        EXPECT_THAT(log.lines(), Each(testing::Field(&SyslogCapture::Line::priority, LOG_INFO)));
    }

    /// The worker's and the watchdog's.
    std::vector<pid_t> threads;
};

TEST_F(SignalFaultTest, InTheWaitForAnAnswerFailsOnePoll) {
    beginAndFindThreads("on any after 6 do silence\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 1));
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectOneFailure(-52007);
    const int failures = log.count(failureLine(-52007));
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    EXPECT_EQ(log.count(failureLine(-52007)), failures);
    EXPECT_EQ(qualities().at(1), usable);
    EXPECT_EQ(qualities().at(2), unreachable);
    EXPECT_EQ(metaData().at(2), defaultMetaData);
    expectNothingWorseThanFailures();
    expectStopWithin({1});
}

TEST_F(SignalFaultTest, InASendThatWaitsForRoomFailsOnePoll) {
    const DatagramSocket deaf("ptp4l.sock");
    const DatagramSocket filler;
    filler.fillQueueOf("ptp4l.sock");
    beginAndFindThreads("start-delay 1000000\n");
    ASSERT_TRUE(waitUntilRequestIsSent());
    expectOneFailure(-52024);
    const int failures = log.count(failureLine(-52024));
    ASSERT_TRUE(waitUntilRequestIsSent());
    EXPECT_EQ(log.count(failureLine(-52024)), failures);
    EXPECT_EQ(qualities().at(1), unreachable);
    EXPECT_THAT(metaData(), Each(defaultMetaData));
    expectNothingWorseThanFailures();
    expectStopWithin({1});
}

// A poll that is caught by the end of a shower fails, and makes an interval longer.
TEST_F(SignalFaultTest, DoesNotShortenASleep) {
    const auto end = std::make_shared<std::atomic<steady_clock::rep>>(0);
    onEachPoll(
        [=](int) { *end = (steady_clock::now() + milliseconds(60)).time_since_epoch().count(); });
    beginAndFindThreads("clock fixed 1000\n");
    {
        const int before = handledSignals();
        const SignalRain rain(
            threads, [=] { return steady_clock::now().time_since_epoch().count() < *end; });
        ASSERT_TRUE(waitForCalls(Function::getTime, 12));
        EXPECT_GT(handledSignals(), before + 50);
    }
    const auto calls = host.calls(Function::getTime);
    for (std::size_t i = 1; i < calls.size(); ++i) {
        EXPECT_GE(calls[i].at - calls[i - 1].at, milliseconds(125));
    }
    EXPECT_EQ(qualities().at(1), usable);
    expectNothingWorseThanFailures();
    host.onCall(nullptr);
    expectStopWithin({});
}

// The host refuses the death, so that the watchdog reports it again after each second.
TEST_F(SignalFaultTest, DoesNotShortenTheWatchdogsSecond) {
    host.onCall([death = died.reason](const RecordingHost::Call& call, zeerr_Status& status) {
        status.code = call.text == death ? -52009 : 0;
    });
    beginAndFindThreads("exit-at-once 0\n");
    const int before = handledSignals();
    const SignalRain rain(threads);
    helpers.threads = 1;
    const auto deaths = [this] {
        Calls chosen = host.calls(Function::setTRQuality);
        chosen.erase(std::remove_if(chosen.begin(), chosen.end(),
                                    [this](const auto& call) { return call.text != died.reason; }),
                     chosen.end());
        return chosen;
    };
    ASSERT_TRUE(waitUntil([=] { return deaths().size() >= 2; }));
    EXPECT_GT(handledSignals(), before + 50);
    EXPECT_GE(deaths().at(1).at - deaths().at(0).at, seconds(1));
    expectStopWithin({});
}

// Each of the system calls there, as often as it takes for signals to meet them.
TEST_F(SignalFaultTest, InInitialiseAndStartChangesNothing) {
    SimulatedDaemon::script("gm present\n");
    session.initialise();
    session.finalise();
    const std::string configuration = readFile(SimulatedDaemon::configFile);
    const SignalRain rain({gettid()});
    helpers.threads = 1;
    for (const int before = handledSignals(); handledSignals() < before + 50;) {
        session.initialise();
        session.finalise();
        ASSERT_EQ(readFile(SimulatedDaemon::configFile), configuration);
    }
    for (int start = 0; start < 8; ++start) {
        const ShortSleeps hurry;
        session.initialise();
        session.start();
        session.stop();
        session.finalise();
    }
    const std::size_t former = host.calls(Function::adjustTime).size();
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, former + 1));
    EXPECT_EQ(qualities().back(), usable);
    expectNothingWorseThanFailures();
    expectStopWithin({});
}

TEST_F(SignalFaultTest, EverywhereAndAllTheTimeHangsNothing) {
    beginAndFindThreads("sync-interval 0.05\n");
    threads.push_back(gettid());
    const SignalRain rain(threads);
    helpers.threads = 1;
    ASSERT_TRUE(waitUntil([this] {
        return host.calls(Function::getTime).size() +
                   static_cast<std::size_t>(log.count(failureLine(-52007))) >=
               15;
    }));
    expectNothingWorseThanFailures();
    expectStopWithin({});
    EXPECT_THAT(sentSignals(), SizeIs(1));
}

// Were its waits cut to the millisecond between two signals, SIGKILL would come after one second.
TEST_F(SignalFaultTest, InStopDoesNotShortenTheGracePeriod) {
    begin("ignore SIGTERM\nat 4 do exit 0\n");
    const pid_t child = daemonPid();
    const SignalRain rain({gettid()});
    helpers.threads = 1;
    expectStopWithin({0, true, seconds(0), true});
    EXPECT_THAT(sentSignals(), ElementsAre(SentSignal{child, SIGTERM}));
    ASSERT_THAT(SimulatedDaemon::events("exit"), SizeIs(1));
    EXPECT_EQ(SimulatedDaemon::events("exit")[0].status, 0);
    expectNothingWorseThanFailures();
}

} // namespace
