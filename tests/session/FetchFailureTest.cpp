#include <algorithm>
#include <filesystem>

#include <gmock/gmock.h>
#include <syslog.h>

#include "SessionFixture.h"

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

const QualityReport unreachable{
    "Unable to communicate with PTP sub process while attempting to retrieve time data", false};

std::string failureLine(int code) {
    return "Unable to communicate with PTP sub process while attempting to retrieve data,"
           "got error: " +
           std::to_string(code);
}

class FetchFailureTest : public SessionTest {
protected:
    /// Expects that the third poll, and none besides, fails with a code.
    void expectThirdPollFails(int code) {
        ASSERT_TRUE(waitForCalls(Function::getTime, 4));
        EXPECT_EQ(log.count(failureLine(code)), 1);
        EXPECT_THAT(qualities(), ElementsAre(waiting, usable, unreachable));
        EXPECT_THAT(log.lines(), Contains(SyslogCapture::Line{LOG_INFO, failureLine(code)}));
        const auto texts = metaData();
        ASSERT_THAT(texts, SizeIs(3));
        EXPECT_EQ(texts[2], defaultMetaData);
    }
};

TEST_F(FetchFailureTest, DaemonThatIsNotThereYet) {
    begin("start-delay 1000000\n");
    ASSERT_TRUE(waitForLog(failureLine(-52024), 3));
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 4));
    auto reports = qualities();
    reports.resize(4);
    EXPECT_THAT(reports, ElementsAre(waiting, unreachable, unreachable, unreachable));
    EXPECT_THAT(metaData(), testing::Each(defaultMetaData));
    EXPECT_THAT(host.calls(Function::getTime), IsEmpty());
    EXPECT_THAT(host.calls(Function::adjustTime), IsEmpty());
    for (const auto& line : log.lines()) {
        EXPECT_EQ(line.priority, LOG_INFO) << line.text;
    }
}

TEST_F(FetchFailureTest, ComesBeforeItsQualityAndItsMetadata) {
    begin("start-delay 1000000\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    const auto lines = log.lines();
    EXPECT_EQ(lines.at(1).text, failureLine(-52024));
    EXPECT_EQ(lines.at(2).text, std::string("update Meta Data: ") + defaultMetaData);
    const auto calls = host.calls();
    EXPECT_EQ(calls.at(2).function, Function::setTRQuality);
    EXPECT_EQ(calls.at(3).function, Function::updateMetaData);
}

TEST_F(FetchFailureTest, EndsWhenTheDaemonAppears) {
    begin("start-delay 0.7\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_GE(log.count(failureLine(-52024)), 1);
    EXPECT_EQ(qualities().back(), usable);
    EXPECT_NE(metaData().back(), defaultMetaData);
}

TEST_F(FetchFailureTest, SilenceTakesTwoSeconds) {
    begin("on any do silence\n");
    ASSERT_TRUE(waitForLog(failureLine(-52007)));
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    const auto calls = host.calls(Function::updateMetaData);
    EXPECT_GE(calls[1].at - calls[0].at, std::chrono::milliseconds(2125));
    EXPECT_EQ(qualities().at(1), unreachable);
}

TEST_F(FetchFailureTest, SingleAnswerThatIsOneOctetLonger) {
    begin("on DEFAULT_DATA_SET after 2 times 1 do length +1\n");
    expectThirdPollFails(-52012);
}

TEST_F(FetchFailureTest, SingleAnswerThatIsOneOctetShorter) {
    begin("on TIME_STATUS_NP after 2 times 1 do length -1\n");
    expectThirdPollFails(-52012);
}

TEST_F(FetchFailureTest, AnswerOfAPortThatIsTooShort) {
    begin("on PORT_DATA_SET_NP after 2 times 1 do length -1\n", R"(["eth0"])");
    expectThirdPollFails(-52012);
}

TEST_F(FetchFailureTest, ErrorAnswer) {
    begin("on PARENT_DATA_SET after 2 times 1 do error 1\n");
    expectThirdPollFails(-52012);
}

TEST_F(FetchFailureTest, LongerAnswerOfAPortIsNone) {
    begin("on PORT_DATA_SET do length +1\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::getTime, 2));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable));
    EXPECT_THAT(metaData().at(1), HasSubstr(R"("Port1":{)"));
}

TEST_F(FetchFailureTest, RecoveryRepeatsNothing) {
    begin("clock fixed 1000\n"
          "on DEFAULT_DATA_SET after 2 times 1 do length +1\n"
          "on DEFAULT_DATA_SET after 6 times 1 do gm off\n"
          "on DEFAULT_DATA_SET after 8 times 1 do gm on\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 5));
    EXPECT_EQ(qualities().at(2), unreachable);
    ASSERT_TRUE(waitForCalls(Function::getTime, 11));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable, unreachable, noRole, usable));
    // At first, with a grandmaster; the failure; without it; with it again.
    const auto texts = metaData();
    ASSERT_THAT(texts, SizeIs(5));
    EXPECT_EQ(texts[2], defaultMetaData);
    EXPECT_NE(texts[3], texts[1]);
    EXPECT_EQ(texts[4], texts[1]);
    std::vector<std::uint64_t> ingress;
    for (const auto& call : host.calls(Function::adjustTime)) {
        ingress.push_back(call.localTime);
    }
    EXPECT_THAT(ingress, ElementsAre(1000, 0, 1000));
}

TEST_F(FetchFailureTest, HostThatRefusesTheQualityGetsNoMetadata) {
    host.onCall([](const RecordingHost::Call& call, zeerr_Status& status) {
        status.code = call.text == unreachable.reason ? -52009 : 0;
    });
    begin("start-delay 1000000\n");
    ASSERT_TRUE(waitForLog("KEL is stopping, ignoring the error: -52009", 2));
    EXPECT_GE(log.count(failureLine(-52024)), 2);
    EXPECT_THAT(metaData(), SizeIs(1));
}

TEST_F(FetchFailureTest, SomethingAtThePathOfTheSocketIsReplaced) {
    writeFile(socketPath(), "stale");
    begin("gm present\n");
    EXPECT_TRUE(waitForCalls(Function::getTime, 1));
    EXPECT_TRUE(std::filesystem::is_socket(socketPath()));
    EXPECT_EQ(log.count(failureLine(-52006)), 0);
}

} // namespace
