#include <cstring>

#include <gmock/gmock.h>
#include <syslog.h>

#include "SessionFixture.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using ReportingTest = SessionTest;

std::uint64_t bits(double value) {
    std::uint64_t pattern = 0;
    std::memcpy(&pattern, &value, sizeof(pattern));
    return pattern;
}

TEST_F(ReportingTest, GrandmasterMakesTheQualityUsable) {
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable));
}

TEST_F(ReportingTest, QualitiesArriveWithTheirExactBitPatterns) {
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::setTRQuality, 2));
    const auto calls = host.calls(Function::setTRQuality);
    EXPECT_EQ(bits(calls[0].quality[0]), 0xC000000000000000U);
    EXPECT_EQ(bits(calls[0].quality[1]), 0xC000000000000000U);
    EXPECT_EQ(bits(calls[0].quality[2]), 0xBFF0000000000000U);
    EXPECT_EQ(bits(calls[1].quality[0]), 0x3E5AD7F29ABCAF48U);
    EXPECT_EQ(bits(calls[1].quality[1]), 0x3EB0C6F7A0B5ED8DU);
    EXPECT_EQ(bits(calls[1].quality[2]), 0xBFF0000000000000U);
}

TEST_F(ReportingTest, WithoutGrandmasterTheRoleNeverChanges) {
    begin("gm absent\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 4));
    EXPECT_THAT(qualities(), ElementsAre(waiting));
    EXPECT_THAT(host.calls(Function::adjustTime), IsEmpty());
}

TEST_F(ReportingTest, GrandmasterComesAndGoes) {
    begin("gm absent\n"
          "on TIME_STATUS_NP after 1 times 1 do gm on\n"
          "on TIME_STATUS_NP after 3 times 1 do gm off\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 6));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable, noRole));
}

TEST_F(ReportingTest, PresenceIsComparedAsTheIntegerReceived) {
    beginMeasured({{0, 0, 1}, {0, 0, 2}, {0, 0, 2}, {0, 0, 0xFFFFFFFF}, {0, 0, 0}});
    ASSERT_TRUE(waitForCalls(Function::getTime, 6));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable, usable, usable, noRole));
}

TEST_F(ReportingTest, OnePassCallsTheHostInItsOrder) {
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    std::vector<Function> functions;
    for (const auto& call : host.calls()) {
        functions.push_back(call.function);
    }
    functions.resize(6);
    EXPECT_THAT(functions, ElementsAre(Function::updateMetaData, Function::setTRQuality,
                                       Function::getTime, Function::setTRQuality,
                                       Function::adjustTime, Function::updateMetaData));
}

TEST_F(ReportingTest, MetadataDescribesTheDaemonByteForByte) {
    begin("clock fixed 1000\n", R"(["eth0","eth1"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    EXPECT_EQ(metaData().at(1),
              R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C","gmMacAddress":"00:1B:21:0A:0B:0C",)"
              R"("localClockId":"02:00:00:FF:FE:00:00:01","clockClass":248,)"
              R"("clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":65535,"priority1":127,)"
              R"("priority2":126,"domainNumber":0,"gmClockClass":6,)"
              R"("gmClockAccuracy":"WITHIN_100NS","gmOffsetLogVariance":20061,)"
              R"("gmPriority1":128,"gmPriority2":128,)"
              R"("Port1":{"portState":"PTP_UNCALIBRATED","asCapable":true,"logSyncInterval":-3,)"
              R"("logAnnounceInterval":1,"logPdelayInterval":0,"interface":"eth0",)"
              R"("neighborPropDelayThreshold":20000000},)"
              R"("Port2":{"portState":"PTP_MASTER","asCapable":true,"logSyncInterval":-3,)"
              R"("logAnnounceInterval":1,"logPdelayInterval":0,"interface":"eth1",)"
              R"("neighborPropDelayThreshold":20000000}})");
}

TEST_F(ReportingTest, IdenticalMetadataIsSentOnce) {
    begin("gm present\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::getTime, 6));
    ASSERT_THAT(metaData(), SizeIs(2));
    EXPECT_EQ(log.count("update Meta Data: " + metaData()[1]), 1);
}

TEST_F(ReportingTest, EveryMetadataIsLoggedBeforeItIsSent) {
    host.onCall([this](const RecordingHost::Call& call, zeerr_Status&) {
        if (call.function == Function::updateMetaData) {
            const SyslogCapture::Line expected{LOG_INFO, "update Meta Data: " + call.text};
            EXPECT_EQ(log.lines().back(), expected);
        }
    });
    begin("gm present\n", R"(["eth0"])");
    EXPECT_TRUE(waitForCalls(Function::updateMetaData, 2));
}

TEST_F(ReportingTest, MetadataEqualToTheDefaultIsNotSentAgain) {
    // All data sets zero and no port: the same as nothing known.
    beginMeasured({{0, 0, 0}});
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_THAT(metaData(), SizeIs(1));
}

TEST_F(ReportingTest, ChangedPortStateSendsMetadataAgain) {
    begin("gm absent\n"
          "on PARENT_DATA_SET after 2 times 1 do gm on\n"
          "on PARENT_DATA_SET after 4 times 1 do gm off\n"
          "set PARENT_DATA_SET.grandmasterIdentity 1\n"
          "set PARENT_DATA_SET.grandmasterPriority1 2\n"
          "set PARENT_DATA_SET.grandmasterClockQuality.clockClass 3\n"
          "set PARENT_DATA_SET.grandmasterClockQuality.clockAccuracy 0x31\n"
          "set PARENT_DATA_SET.grandmasterClockQuality.offsetScaledLogVariance 4\n"
          "set PARENT_DATA_SET.grandmasterPriority2 5\n"
          "set PORT_DATA_SET_NP.asCapable 1\n",
          R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 4));
    ASSERT_TRUE(waitForCalls(Function::getTime, 7));
    const auto texts = metaData();
    ASSERT_THAT(texts, SizeIs(4));
    EXPECT_THAT(texts[1], testing::HasSubstr(R"("portState":"PTP_LISTENING")"));
    EXPECT_THAT(texts[2], testing::HasSubstr(R"("portState":"PTP_UNCALIBRATED")"));
    EXPECT_THAT(texts[3], testing::HasSubstr(R"("portState":"PTP_MASTER")"));
    EXPECT_THAT(texts[3], testing::HasSubstr(R"("gmClockAccuracy":"GREATER_THAN_10S")"));
}

TEST_F(ReportingTest, InterfaceNameCannotBreakTheMetadata) {
    begin("gm present\n"
          "interface-name 1 a\"b\\c\n",
          R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    EXPECT_THAT(metaData().at(1), testing::HasSubstr(R"("interface":"a\"b\\c")"));
}

TEST_F(ReportingTest, InterfaceNameIsNoFormatOfTheLogLine) {
    begin("gm present\n"
          "interface-name 1 %s%n%999999d\n",
          R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    EXPECT_THAT(metaData().at(1), testing::HasSubstr(R"("interface":"%s%n%999999d")"));
    EXPECT_EQ(log.count("update Meta Data: " + metaData().at(1)), 1);
}

TEST_F(ReportingTest, WithoutPortsMetadataEndsAfterTheGrandmaster) {
    begin("ports 0\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    EXPECT_THAT(metaData().at(1), testing::EndsWith(R"("gmPriority1":128,"gmPriority2":128})"));
}

} // namespace
