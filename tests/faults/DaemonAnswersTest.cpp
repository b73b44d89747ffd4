// A daemon that answers late, wrongly, too much or not at all.

#include <gmock/gmock.h>
#include <syslog.h>

#include "FaultTest.h"

namespace {

using testing::Each;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using DaemonAnswersTest = FaultTest;

TEST_F(DaemonAnswersTest, NeverComes) {
    beginWell("on any after 6 do silence\n");
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectStopWithin({1});
    expectFailure(-52007);
    EXPECT_THAT(host.calls(Function::getTime), SizeIs(1));
}

// Each answer of a poll may take 2 s. A clock without ports gives three.
TEST_F(DaemonAnswersTest, EachJustInTimeMakesAPollTakeTheSum) {
    beginWell("on any after 6 do delay 1.5\n");
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectStopWithin({3});
    EXPECT_THAT(host.calls(Function::getTime), SizeIs(2));
    EXPECT_THAT(newQualities(), IsEmpty());
}

// One that is too late for its own request may be in time for the next one, which is followed by
// another wait.
TEST_F(DaemonAnswersTest, EachTooLateIsAFailure) {
    beginWell("on any after 6 do delay 2.5\n");
    expectFailure(-52007);
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectStopWithin({2});
    EXPECT_THAT(host.calls(Function::getTime), SizeIs(1));
}

// None has the 104 octets of the answer.
TEST_F(DaemonAnswersTest, GarbageOfManyLengths) {
    const std::vector<int> lengths = {0,  1,  33, 34,  47,  48,   53,   54,   55,   85,
                                      86, 87, 99, 103, 105, 1499, 1500, 1501, 9000, 65000};
    std::string script;
    std::size_t requests = 6;
    for (const int length : lengths) {
        script += "on any after " + std::to_string(requests++) + " times 1 do garbage " +
                  std::to_string(length) + "\n";
    }
    beginWell(script + "on any after " + std::to_string(requests + 12) + " do garbage 65000\n");
    expectFailure(-52012);
    const int failures = static_cast<int>(lengths.size());
    ASSERT_TRUE(waitForLog(failureLine(-52012), failures + 2));
    // At first, and twice behind the lengths.
    EXPECT_THAT(host.calls(Function::getTime), SizeIs(3));
    EXPECT_THAT(newQualities(), testing::Each(unreachable));
    expectStopWithin({});
}

// The measurement is told by its length alone.
TEST_F(DaemonAnswersTest, GarbageOfTheRightLengthIsBelieved) {
    beginWell("clock fixed 1000\non TIME_STATUS_NP after 1 do garbage 104\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 3));
    EXPECT_EQ(host.calls(Function::adjustTime).at(0).localTime, 1000U);
    EXPECT_NE(host.calls(Function::adjustTime).at(1).localTime, 1000U);
    EXPECT_THAT(newQualities(), Each(usable));
    EXPECT_THAT(newQualities(), testing::Not(IsEmpty()));
    EXPECT_THAT(log.lines(), Each(testing::Field(&SyslogCapture::Line::priority, LOG_INFO)));
    expectStopWithin({});
}

TEST_F(DaemonAnswersTest, ForOtherPortsAreReportedUnderTheirNumbers) {
    beginWell("on any do other-port\n", R"(["eth0"])");
    EXPECT_THAT(metaData().back(), HasSubstr(R"("Port101":{)"));
    EXPECT_THAT(newQualities(), IsEmpty());
    expectStopWithin({});
}

TEST_F(DaemonAnswersTest, FewerThanPorts) {
    beginWell("on PORT_DATA_SET after 1 do answers -1\n", R"(["eth0","eth1"])");
    // The first poll has six requests, the next one gets to its fourth.
    ASSERT_TRUE(SimulatedDaemon::waitFor("request", 10));
    expectStopWithin({1});
    expectFailure(-52007);
}

TEST_F(DaemonAnswersTest, MoreThanPorts) {
    beginWell("on PORT_PROPERTIES_NP after 1 do answers +1\n", R"(["eth0"])");
    expectFailure(-52012);
    ASSERT_TRUE(waitForLog(failureLine(-52012), 2));
    // Every other poll finds what the one before has left.
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_THAT(newQualities(), testing::Each(unreachable));
    expectStopWithin({});
}

TEST_F(DaemonAnswersTest, ThousandfoldAreFailures) {
    beginWell("on any after 6 do flood 1000\n");
    expectFailure(-52012);
    ASSERT_TRUE(waitForLog(failureLine(-52012), 3));
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectStopWithin({});
}

// The answer of the second port is missing. If it came just in time, and so on, each of the 65535
// would add to the sum.
TEST_F(DaemonAnswersTest, ClaimOf65535Ports) {
    begin("set DEFAULT_DATA_SET.numberPorts 65535\n", R"(["eth0"])");
    ASSERT_TRUE(SimulatedDaemon::waitFor("request", 4));
    expectStopWithin({1});
    EXPECT_EQ(log.count(failureLine(-52007)), 1);
    EXPECT_EQ(qualities().back(), unreachable);
    EXPECT_EQ(metaData().back(), defaultMetaData);
    EXPECT_THAT(host.calls(Function::getTime), IsEmpty());
}

} // namespace
