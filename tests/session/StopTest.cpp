#include <atomic>
#include <csignal>
#include <filesystem>
#include <future>
#include <memory>

#include <gmock/gmock.h>

#include "Interposed.h"
#include "SessionFixture.h"
#include "support/Descriptors.h"

namespace {

using std::chrono::seconds;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class StopTest : public SessionTest {
protected:
    /// Expects that the daemon was asked to end, did so, and nothing else was sent to anybody.
    void expectEndedBySigterm() {
        const auto starts = SimulatedDaemon::events("start");
        ASSERT_THAT(starts, SizeIs(1));
        EXPECT_THAT(sentSignals(), ElementsAre(SentSignal{starts[0].pid, SIGTERM}));
        EXPECT_THAT(SimulatedDaemon::events("signal"), SizeIs(1));
        ASSERT_THAT(SimulatedDaemon::events("exit"), SizeIs(1));
        EXPECT_EQ(SimulatedDaemon::events("exit")[0].status, 0);
        EXPECT_FALSE(hasChildren());
        expectOwnThreads(0);
    }
};

TEST_F(StopTest, EndsTheThreadsAndTheDaemon) {
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 2));
    session.stop();
    expectEndedBySigterm();
    const std::size_t calls = host.calls().size();
    session.finalise();
    EXPECT_EQ(host.calls().size(), calls);
    EXPECT_EQ(log.count("PTP sub process has died unexpectedly"), 0);
}

TEST_F(StopTest, RightAfterStart) {
    begin("gm present\n");
    session.stop();
    EXPECT_FALSE(hasChildren());
    expectOwnThreads(0);
    ASSERT_THAT(sentSignals(), SizeIs(1));
    EXPECT_EQ(sentSignals()[0].number, SIGTERM);
}

TEST_F(StopTest, SecondTimeDoesNothing) {
    begin("gm present\n");
    ASSERT_TRUE(SimulatedDaemon::waitFor("bound"));
    session.stop();
    expectEndedBySigterm();
    session.stop();
    session.stop();
    EXPECT_THAT(sentSignals(), SizeIs(1));
}

TEST_F(StopTest, WithoutStartDoesNothing) {
    session.initialise();
    session.stop();
    session.stop();
    EXPECT_THAT(sentSignals(), IsEmpty());
    EXPECT_THAT(host.calls(), IsEmpty());
    EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(StopTest, AfterARefusedStartDoesNothing) {
    session.initialise();
    host.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = -1; });
    HostStatus status;
    session.start(status);
    session.stop();
    EXPECT_THAT(sentSignals(), IsEmpty());
    EXPECT_FALSE(hasChildren());
}

TEST_F(StopTest, AfterTheDaemonDiedSignalsNobody) {
    begin("exit-at-once 3\n");
    expectOwnThreads(1);
    session.stop();
    EXPECT_THAT(sentSignals(), IsEmpty());
    EXPECT_FALSE(hasChildren());
    expectOwnThreads(0);
}

TEST_F(StopTest, WritesNoLogLine) {
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    session.stop();
    EXPECT_THAT(log.lines(), testing::Each(testing::Field(&SyslogCapture::Line::text,
                                                          testing::StartsWith("update Meta"))));
}

TEST_F(StopTest, WaitsForACallThatIsUnderWay) {
    struct Gate {
        std::atomic<bool> entered{false};
        std::atomic<bool> open{false};
    };
    const auto gate = std::make_shared<Gate>();
    onEachPoll([=](int) {
        gate->entered = true;
        waitUntil([&] { return gate->open.load(); });
    });
    begin("gm present\n");
    ASSERT_TRUE(waitUntil([&] { return gate->entered.load(); }));
    auto stopped = std::async(std::launch::async, [this] { session.stop(); });
    // The watchdog has seen the request; only the worker is left, and the thread that stops.
    expectOwnThreads(2);
    EXPECT_EQ(stopped.wait_for(seconds(0)), std::future_status::timeout);
    EXPECT_THAT(sentSignals(), IsEmpty());
    gate->open = true;
    EXPECT_EQ(stopped.wait_for(seconds(20)), std::future_status::ready);
    stopped.get();
    expectEndedBySigterm();
}

TEST_F(StopTest, WithAHostThatRefusesEverything) {
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 1));
    host.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = -52009; });
    session.stop();
    expectEndedBySigterm();
    EXPECT_EQ(log.count("PTP sub process has died unexpectedly"), 0);
}

TEST_F(StopTest, NothingIsLeftBehindAfterFinalise) {
    const int descriptors = openDescriptors();
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_GT(openDescriptors(), descriptors);
    EXPECT_TRUE(std::filesystem::is_socket(socketPath()));
    session.stop();
    session.finalise();
    EXPECT_EQ(openDescriptors(), descriptors);
    expectOwnThreads(0);
    EXPECT_FALSE(hasChildren());
    EXPECT_FALSE(std::filesystem::exists(socketPath()));
    EXPECT_FALSE(std::filesystem::exists("ptp4l.sock"));
}

TEST_F(StopTest, FinaliseWithoutStartLeavesNothingBehind) {
    const int descriptors = openDescriptors();
    session.initialise();
    session.finalise();
    EXPECT_EQ(openDescriptors(), descriptors);
    EXPECT_FALSE(std::filesystem::exists(socketPath()));
}

TEST_F(StopTest, SecondSessionFollowsTheFirst) {
    for (std::size_t run = 1; run <= 2; ++run) {
        const std::size_t pairs = host.calls(Function::adjustTime).size();
        begin("gm present\n", R"(["eth0"])");
        ASSERT_TRUE(waitForCalls(Function::adjustTime, pairs + 2));
        session.stop();
        session.finalise();
        EXPECT_FALSE(hasChildren());
        expectOwnThreads(0);
        EXPECT_THAT(SimulatedDaemon::events("exit"), SizeIs(run));
    }
    const QualityReport waiting{"Waiting for ptp4l status", false};
    const QualityReport usable{"PTP role has changed.", true};
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable, waiting, usable));
}

TEST_F(StopTest, NextSessionInTheSameProcessStartsWithAFreshSequence) {
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 1));
    session.stop();
    session.finalise();
    const std::size_t earlier = SimulatedDaemon::events("request").size();
    begin("gm present\n");
    ASSERT_TRUE(SimulatedDaemon::waitFor("request", earlier + 1));
    EXPECT_EQ(SimulatedDaemon::events("request").at(earlier).octets.substr(60, 4), "0000");
}

} // namespace
