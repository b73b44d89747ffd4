#include <array>
#include <thread>

#include <gmock/gmock.h>
#include <syslog.h>

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

} // namespace
