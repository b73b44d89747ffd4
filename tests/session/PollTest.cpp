#include <algorithm>
#include <filesystem>

#include <gmock/gmock.h>

#include "SessionFixture.h"

namespace {

using testing::Each;
using testing::ElementsAre;
using testing::SizeIs;
using PollTest = SessionTest;

using Event = SimulatedDaemon::Event;

/// An unsigned integer of a request. `at` and `octets` count octets.
unsigned long fieldOf(const Event& request, std::size_t at, std::size_t octets) {
    return std::stoul(request.octets.substr(2 * at, 2 * octets), nullptr, 16);
}

unsigned long sequenceId(const Event& request) {
    return fieldOf(request, 30, 2);
}

unsigned long managementId(const Event& request) {
    return fieldOf(request, 52, 2);
}

template <typename Field>
std::vector<unsigned long> each(const std::vector<Event>& events, Field field) {
    std::vector<unsigned long> values;
    std::transform(events.begin(), events.end(), std::back_inserter(values), field);
    return values;
}

constexpr char timedOut[] = "Unable to communicate with PTP sub process while attempting to "
                            "retrieve data,got error: -52007";

std::string withFollowUpInfo(const std::string& transportSpecific) {
    static const std::string off = R"("followUpInfo":false)";
    std::string configuration = sessionConfiguration("[]", transportSpecific);
    return configuration.replace(configuration.find(off), off.size(), R"("followUpInfo":true)");
}

TEST_F(PollTest, AsksForSixDataSetsInTheirOrder) {
    begin("gm present\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::getTime, 2));
    auto requests = SimulatedDaemon::events("request");
    ASSERT_GE(requests.size(), 12U);
    requests.resize(12);
    EXPECT_THAT(each(requests, managementId),
                ElementsAre(0xC000, 0x2002, 0x2000, 0x2004, 0xC002, 0xC004, 0xC000, 0x2002, 0x2000,
                            0x2004, 0xC002, 0xC004));
}

TEST_F(PollTest, KeepsItsSocketAndItsSequence) {
    begin("gm present\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    ASSERT_TRUE(SimulatedDaemon::waitFor("request", 18));
    auto requests = SimulatedDaemon::events("request");
    requests.resize(18);
    EXPECT_THAT(each(requests, sequenceId),
                ElementsAre(0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16, 17));
    for (const auto& request : requests) {
        EXPECT_EQ(request.from, "./" + socketPath());
    }
}

TEST_F(PollTest, SequenceRunsOnAcrossAFailure) {
    begin("on PARENT_DATA_SET times 1 do length +1\n");
    // Nobody waits for answers of no ports.
    ASSERT_TRUE(SimulatedDaemon::waitFor("request", 8));
    auto requests = SimulatedDaemon::events("request");
    requests.resize(8);
    EXPECT_THAT(each(requests, sequenceId), ElementsAre(0, 1, 2, 3, 4, 5, 6, 7));
    EXPECT_THAT(each(requests, managementId),
                ElementsAre(0xC000, 0x2002, 0xC000, 0x2002, 0x2000, 0x2004, 0xC002, 0xC004));
}

TEST_F(PollTest, FailureRemovesTheSocketAndTheNextPollBindsItAnew) {
    begin("on any do silence\n");
    ASSERT_TRUE(waitUntil([] { return std::filesystem::exists(socketPath()); }));
    ASSERT_TRUE(waitUntil([] { return !std::filesystem::exists(socketPath()); }));
    EXPECT_TRUE(waitUntil([] { return std::filesystem::exists(socketPath()); }));
}

TEST_F(PollTest, AnswersThatComeTooLateDoNoHarm) {
    begin("on TIME_STATUS_NP times 1 do late\n");
    ASSERT_TRUE(waitForLog(timedOut));
    EXPECT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_EQ(qualities().back(), (QualityReport{"PTP role has changed.", true}));
}

TEST_F(PollTest, DaemonThatNeedsThePadOctetCountedFailsOnce) {
    begin("padding strict\n", R"(["eth0","eth1"])");
    ASSERT_TRUE(waitForCalls(Function::getTime, 4));
    EXPECT_EQ(log.count(timedOut), 1);
    const auto calls = host.calls();
    const auto firstSuccess = std::find_if(calls.begin(), calls.end(), [](const auto& call) {
        return call.function == Function::getTime;
    });
    EXPECT_GE(firstSuccess->at - calls.at(0).at, std::chrono::milliseconds(2250));
    std::vector<unsigned long> lengths;
    for (const auto& request : SimulatedDaemon::events("request")) {
        if (managementId(request) == 0xC004) {
            lengths.push_back(fieldOf(request, 2, 2));
            EXPECT_EQ(request.octets.size(), 2 * 68U);
        }
    }
    lengths.resize(4);
    EXPECT_THAT(lengths, ElementsAre(67, 68, 68, 68));
}

TEST_F(PollTest, DaemonThatDoesNotCareNeverSeesThePadOctetCounted) {
    begin("padding lenient\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    for (const auto& request : SimulatedDaemon::events("request")) {
        EXPECT_EQ(fieldOf(request, 2, 2),
                  managementId(request) == 0xC004 ? 67U : request.octets.size() / 2);
    }
}

TEST_F(PollTest, DaemonThatTakesFollowUpInfoForIeee8021AsDropsTransportSpecific0) {
    SimulatedDaemon::script("follow-up-info strict\n");
    session.initialise(withFollowUpInfo("0x0"));
    session.start();
    ASSERT_TRUE(waitForLog(timedOut, 2));
    EXPECT_THAT(host.calls(Function::getTime), testing::IsEmpty());
    ASSERT_TRUE(SimulatedDaemon::waitFor("request", 2));
    for (const auto& request : SimulatedDaemon::events("request")) {
        EXPECT_EQ(request.ignored, "not of IEEE 802.1AS");
    }
}

TEST_F(PollTest, DaemonThatTakesFollowUpInfoForIeee8021AsAnswersTransportSpecific1) {
    SimulatedDaemon::script("follow-up-info strict\n");
    session.initialise(withFollowUpInfo("0x1"));
    session.start();
    EXPECT_TRUE(waitForCalls(Function::getTime, 2));
}

TEST_F(PollTest, PortsAreReportedByNumberWhateverTheOrderOfTheirAnswers) {
    begin("on PORT_DATA_SET do reorder\n"
          "on PORT_PROPERTIES_NP do reorder\n"
          "on PORT_DATA_SET_NP do reorder\n"
          "port-state 2 7\n"
          "port-state 3 10\n",
          R"(["eth0","eth1","eth2"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    const std::string text = metaData().at(1);
    const auto first = text.find(R"("Port1":{"portState":"PTP_UNCALIBRATED")");
    const auto second = text.find(R"("Port2":{"portState":"PTP_PASSIVE")");
    const auto third = text.find(R"("Port3":{"portState":"PTP_GRAND_MASTER")");
    EXPECT_LT(first, second);
    EXPECT_LT(second, third);
    EXPECT_NE(third, std::string::npos);
}

} // namespace
