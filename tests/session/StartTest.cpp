#include <algorithm>
#include <array>
#include <atomic>
#include <csignal>
#include <memory>
#include <thread>

#include <gmock/gmock.h>
#include <sys/wait.h>
#include <syslog.h>
#include <unistd.h>

#include "SessionFixture.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using StartTest = SessionTest;

TEST_F(StartTest, ReportsBeforeThereIsAChild) {
    host.onCall(
        [starter = std::this_thread::get_id()](const RecordingHost::Call& call, zeerr_Status&) {
            EXPECT_FALSE(call.thread == starter && hasChildren());
        });
    SimulatedDaemon::script("gm absent\n");
    session.initialise();
    EXPECT_THAT(host.calls(), IsEmpty());
    EXPECT_FALSE(hasChildren());
    session.start();
    EXPECT_TRUE(hasChildren());
    const auto calls = host.calls();
    ASSERT_GE(calls.size(), 2U);
    EXPECT_EQ(calls[0].function, Function::updateMetaData);
    EXPECT_EQ(calls[0].text,
              R"({"gmClockId":"00:00:00:00:00:00:00:00","gmMacAddress":"00:00:00:00:00:00",)"
              R"("localClockId":"00:00:00:00:00:00:00:00","clockClass":0,)"
              R"("clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":0,"priority1":0,)"
              R"("priority2":0,"domainNumber":0,"gmClockClass":0,)"
              R"("gmClockAccuracy":"ACCURACY_UNKNOWN","gmOffsetLogVariance":0,"gmPriority1":0,)"
              R"("gmPriority2":0})");
    EXPECT_EQ(calls[1].function, Function::setTRQuality);
    EXPECT_EQ(calls[1].text, "Waiting for ptp4l status");
    EXPECT_EQ(calls[1].quality, (std::array<double, 3>{-2.0, -2.0, -1.0}));
    EXPECT_EQ(calls[0].thread, std::this_thread::get_id());
    EXPECT_EQ(calls[1].thread, std::this_thread::get_id());
    EXPECT_EQ(log.lines().at(0),
              (SyslogCapture::Line{LOG_INFO, std::string("update Meta Data: ") + defaultMetaData}));
}

TEST_F(StartTest, GivesEveryCallTheSlotAndAFreshStatus) {
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    for (const auto& call : host.calls()) {
        EXPECT_EQ(call.context, session.slot());
        EXPECT_EQ(call.codeOnEntry, 0);
        EXPECT_FALSE(call.textOnEntry);
        EXPECT_EQ(call.timeOnEntry, 0U);
    }
}

TEST_F(StartTest, DoesNotWaitForTheDaemon) {
    begin("start-delay 1000000\n");
    EXPECT_TRUE(hasChildren());
    EXPECT_THAT(SimulatedDaemon::events("bound"), IsEmpty());
    EXPECT_THAT(host.calls(Function::getTime), IsEmpty());
}

TEST_F(StartTest, HasTwoThreads) {
    begin("gm absent\n");
    expectOwnThreads(2);
}

TEST_F(StartTest, DoesNothingWithAnErrorOnEntry) {
    session.initialise();
    HostStatus status(-7, R"({"mine":1})");
    session.start(status);
    EXPECT_EQ(status.code, -7);
    EXPECT_EQ(status.text(), R"({"mine":1})");
    EXPECT_THAT(host.calls(), IsEmpty());
    EXPECT_FALSE(hasChildren());
}

TEST_F(StartTest, SucceedsAfterARefusal) {
    SimulatedDaemon::script("gm absent\n");
    session.initialise();
    host.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = -1; });
    HostStatus refused;
    session.start(refused);
    EXPECT_EQ(refused.code, -1);
    host.onCall(nullptr);
    session.start();
    EXPECT_TRUE(waitForCalls(Function::getTime, 1));
}

TEST_F(StartTest, GoesOnAfterAWarningOfTheHost) {
    host.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = 1; });
    begin("gm present\n");
    EXPECT_TRUE(waitForCalls(Function::getTime, 1));
    EXPECT_THAT(qualities().at(0), (QualityReport{"Waiting for ptp4l status", false}));
}

class SecondStartTest : public StartTest {
protected:
    Calls pairsOf(std::thread::id worker) const {
        Calls pairs = host.calls(Function::adjustTime);
        pairs.erase(std::remove_if(pairs.begin(), pairs.end(),
                                   [worker](const auto& pair) { return pair.thread != worker; }),
                    pairs.end());
        return pairs;
    }

    /// Starts the session again, in a thread that never ends. The second worker is held behind its
    /// first poll, and the first one until then: both use one socket, and would take each other's
    /// answers.
    /// @return whether there is a second worker.
    bool startAgain(std::thread::id first) {
        auto firstIsHeld = std::make_shared<std::atomic<bool>>(false);
        auto secondIsHeld = std::make_shared<std::atomic<bool>>(false);
        host.onCall([=](const RecordingHost::Call& call, zeerr_Status&) {
            if (call.function != Function::getTime) {
                return;
            }
            if (call.thread == first) {
                *firstIsHeld = true;
                waitUntil([&] { return secondIsHeld->load(); });
            } else {
                *secondIsHeld = true;
                pause();
            }
        });
        if (!waitUntil([&] { return firstIsHeld->load(); })) {
            return false;
        }
        std::thread([this] { session.start(); }).detach();
        return waitUntil([&] { return secondIsHeld->load(); });
    }

    /// In a process of its own, which it ends.
    /// @return 0 when the first worker's pairs keep the epoch offset that it has read.
    [[noreturn]] void startTwice() {
        constexpr std::uint64_t epochOffset = 1000000;
        fifo->write({epochOffset});
        begin("sync-interval 0.02\n");
        bool good = waitForCalls(Function::adjustTime, 1);
        const auto first = host.calls(Function::adjustTime).at(0).thread;
        good = good && startAgain(first);
        const std::size_t before = pairsOf(first).size();
        good = good && waitUntil([&] { return pairsOf(first).size() > before + 1; });
        for (const auto& pair : pairsOf(first)) {
            good = good && pair.localTime - pair.referenceTime == epochOffset;
        }
        _exit(good ? 0 : 1);
    }
};

// The host must not do this. Were the history shared, the first worker's pairs would be wrong.
TEST_F(SecondStartTest, LeavesTheFirstWorkerItsHistory) {
#ifdef __SANITIZE_THREAD__
    GTEST_SKIP() << "both workers use the one socket, unguarded";
#endif
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        startTwice();
    }
    int status = -1;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    for (const auto& start : SimulatedDaemon::events("start")) {
        kill(start.pid, SIGKILL);
    }
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0);
}

} // namespace
