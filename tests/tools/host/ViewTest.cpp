#include <algorithm>
#include <array>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ConfigReload.h"
#include "ViewLines.h"

using namespace vantelhost;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;
using testing::StartsWith;

namespace {

constexpr std::array usable{2.5e-08, 1e-06, -1.0};
constexpr std::array unusable{-2.0, -2.0, -1.0};
constexpr ScreenSize roomy{40, 120};

Json metadataWithPorts(int ports) {
    Json metadata{{"gmClockId", "00:1B:21:FF:FE:0A:0B:0C"},
                  {"localClockId", "02:00:00:FF:FE:00:00:01"},
                  {"clockClass", 248},
                  {"clockAccuracy", "ACCURACY_UNKNOWN"},
                  {"gmClockClass", 6},
                  {"gmClockAccuracy", "WITHIN_100NS"}};
    for (int port = 1; port <= ports; ++port) {
        metadata["Port" + std::to_string(port)] = {
            {"portState", port == 1 ? "PTP_SLAVE" : "PTP_MASTER"},
            {"interface", "eth" + std::to_string(port - 1)}};
    }
    return metadata;
}

ViewState running() {
    ViewState state;
    update(state, loadedEvent("l", "IEEE 1588-2008 BC", 2), 0);
    update(state, qualityEvent(unusable.data(), "Waiting for ptp4l status"), 0.5);
    update(state, startedEvent(), 0.5);
    return state;
}

ViewState following() {
    ViewState state = running();
    update(state, qualityEvent(usable.data(), "PTP role has changed."), 5);
    update(state, metadataEvent(metadataWithPorts(2)), 5);
    update(state, pairEvent(1000, 997, -3), 6);
    update(state, pairEvent(2000, 2004, 4), 7);
    return state;
}

} // namespace

TEST(View, BeforeAnythingIsKnown) {
    EXPECT_THAT(viewLines(running(), 3.9, roomy),
                ElementsAre("IEEE 1588-2008 BC, starting, up 0:00:03",
                            "quality       unusable for 0:00:03: Waiting for ptp4l status",
                            "grandmaster   none yet", "this clock    none yet",
                            "offset        none yet", "last 60 s     no pairs", "pairs         0",
                            "ports         none", "last errors   none"));
}

TEST(View, FollowingAGrandmaster) {
    EXPECT_THAT(viewLines(following(), 3729, roomy),
                ElementsAre("IEEE 1588-2008 BC, starting, up 1:02:09",
                            "quality       usable for 1:02:04: PTP role has changed.",
                            "grandmaster   00:1B:21:FF:FE:0A:0B:0C, class 6, WITHIN_100NS",
                            "this clock    02:00:00:FF:FE:00:00:01, class 248, ACCURACY_UNKNOWN",
                            "offset        4 ns, 1:02:02 ago", "last 60 s     no pairs",
                            "pairs         2", "ports         Port1   PTP_SLAVE         eth0",
                            "              Port2   PTP_MASTER        eth1", "last errors   none"));
    EXPECT_EQ(viewLines(following(), 8, roomy)[5],
              "last 60 s     min -3 ns, max 4 ns, rms 4 ns, 0.5 pairs/s");
}

TEST(View, FailuresAreListedWithTheirAgeLatestFirst) {
    ViewState state = following();
    update(state, failureEvent("zekel_getTime", "called with a null pointer"), 60);
    update(state, qualityEvent(unusable.data(), "PTP sub process has died unexpectedly"), 70);
    update(state, refusedEvent("zekel_adjustTime"), 71);
    const auto lines = viewLines(state, 72, roomy);
    ASSERT_EQ(lines.size(), 12U);
    EXPECT_EQ(lines[1],
              "quality       unusable for 0:00:02: PTP sub process has died unexpectedly");
    EXPECT_EQ(lines[9], "last errors   0:00:01 ago  zekel_adjustTime: the host is stopping");
    EXPECT_EQ(lines[10],
              "              0:00:02 ago  unusable: PTP sub process has died unexpectedly");
    EXPECT_EQ(lines[11], "              0:00:12 ago  zekel_getTime: called with a null pointer");
}

TEST(View, ProblemsAreKeptFiveAndRepeatedOnesOnce) {
    ViewState state = running();
    for (int i = 0; i < 9; ++i) {
        update(state, failureEvent("a", std::to_string(i / 2 * 2)), i);
    }
    ASSERT_EQ(state.problems.size(), 5U);
    EXPECT_EQ(state.problems.front().text, "a: 0");
    EXPECT_EQ(state.problems.front().seconds, 1);
    update(state, failureEvent("a", "new"), 10);
    EXPECT_EQ(state.problems.size(), 5U);
    EXPECT_EQ(state.problems.front().text, "a: 2");
}

TEST(View, ARepeatedQualityKeepsItsAge) {
    ViewState state = following();
    update(state, qualityEvent(usable.data(), "PTP role has changed."), 20);
    EXPECT_EQ(state.qualitySince, 5);
}

TEST(View, InvalidMetadataIsAProblemAndLeavesTheGrandmaster) {
    ViewState state = following();
    update(state, invalidMetadataEvent("{"), 8);
    EXPECT_EQ(state.problems.back().text, "metadata: invalid, not a JSON object: {");
    EXPECT_THAT(viewLines(state, 8, roomy)[2], StartsWith("grandmaster   00:1B:21"));
}

TEST(View, MetricsThatAreNotServedAreAProblem) {
    ViewState state = following();
    update(state, metricsEvent("127.0.0.1:9993", "Address already in use"), 8);
    update(state, metricsEvent("127.0.0.1:9993", ""), 9);
    EXPECT_EQ(state.problems.back().text,
              "metrics not served at 127.0.0.1:9993: Address already in use; tried again");
}

TEST(View, WhatARereadingAndTheOutputsCannotDoAreProblems) {
    ViewState state = following();
    update(state, rereadEvent({{"a.toml:2: nonsense: is unknown"}, {}, std::nullopt, {}}), 8);
    EXPECT_THAT(state.problems.back().text, StartsWith("configuration: "));
    EXPECT_THAT(state.problems.back().text, HasSubstr("a.toml:2: nonsense: is unknown"));
    update(state, lostEvent("record a", 3, 2, "No space left on device"), 9);
    EXPECT_THAT(state.problems.back().text, StartsWith("lost record a: 3 events in 2.000 s"));
    update(state, statusSocketEvent("/run/s", "Permission denied"), 10);
    EXPECT_EQ(state.problems.back().text, "status-socket /run/s: Permission denied; tried again");
    const std::size_t problems = state.problems.size();
    update(state, rereadEvent({}), 11);
    EXPECT_EQ(state.problems.size(), problems);
}

TEST(View, PhasesAndChronydAreNamed) {
    ViewState state = following();
    update(state, chronyEvent({3, 0, 0}, ""), 8);
    update(state, stoppingEvent("SIGINT"), 9);
    const auto lines = viewLines(state, 9, roomy);
    EXPECT_EQ(lines[0], "IEEE 1588-2008 BC, stopping (SIGINT), up 0:00:09");
    EXPECT_THAT(lines, Contains("chronyd       takes the pairs; 3 sent, 0 failed"));
    update(state, stoppedEvent(), 9);
    EXPECT_EQ(viewLines(state, 9, roomy)[0], "IEEE 1588-2008 BC, stopped, up 0:00:09");
}

TEST(View, LinesAreCutToTheWidth) {
    for (const auto& line : viewLines(following(), 8, {40, 30})) {
        EXPECT_THAT(line, SizeIs(testing::Le(30U)));
    }
    EXPECT_EQ(viewLines(following(), 8, {40, 30})[3], "this clock    02:00:00:FF:F...");
}

TEST(View, PortsAreLeftOutBeforeErrors) {
    ViewState state = following();
    update(state, metadataEvent(metadataWithPorts(16)), 8);
    const auto lines = viewLines(state, 8, {12, 80});
    ASSERT_EQ(lines.size(), 12U);
    EXPECT_EQ(lines[7], "ports         Port1   PTP_SLAVE         eth0");
    EXPECT_EQ(lines[9], "              Port3   PTP_MASTER        eth2");
    EXPECT_EQ(lines[10], "              13 more");
    EXPECT_EQ(lines[11], "last errors   none");
    EXPECT_THAT(viewLines(state, 8, {24, 80}), SizeIs(24));
    EXPECT_THAT(viewLines(state, 8, {24, 80}),
                Contains("              Port16  PTP_MASTER        eth15"));
    EXPECT_THAT(viewLines(state, 8, {24, 80}), Not(Contains(testing::HasSubstr("more"))));
}

TEST(View, AnyHeightIsKept) {
    for (std::size_t rows = 0; rows < 20; ++rows) {
        EXPECT_THAT(viewLines(following(), 8, {rows, 80}), SizeIs(std::min<std::size_t>(rows, 10)));
    }
}

TEST(View, TextsOfThePlugInCannotControlTheTerminal) {
    ViewState state = running();
    update(state, qualityEvent(usable.data(), "a\x1b[2J\n\xFF"), 1);
    EXPECT_EQ(viewLines(state, 1, roomy)[1], "quality       usable for 0:00:00: a\\x1B[2J\\x0A?");
}

TEST(View, ALongQualityIsWrapped) {
    ViewState state = running();
    update(state,
           qualityEvent(unusable.data(), "Unable to communicate with PTP sub process while "
                                         "attempting to retrieve time data"),
           1);
    const auto lines = viewLines(state, 2, {24, 80});
    EXPECT_EQ(lines[1],
              "quality       unusable for 0:00:01: Unable to communicate with PTP sub process");
    EXPECT_EQ(lines[2], "              while attempting to retrieve time data");
    EXPECT_THAT(lines[3], StartsWith("grandmaster"));
}

TEST(View, AWordLongerThanALineIsBroken) {
    ViewState state = running();
    update(state, qualityEvent(unusable.data(), std::string(30, 'x')), 1);
    const auto lines = viewLines(state, 1, {24, 40});
    EXPECT_EQ(lines[1], "quality       unusable for 0:00:00:");
    EXPECT_EQ(lines[2], "              " + std::string(26, 'x'));
    EXPECT_EQ(lines[3], "              xxxx");
}

TEST(View, ALongErrorShowsBothEnds) {
    ViewState state = running();
    update(state, failureEvent("start", std::string(80, 'x') + " the end"), 1);
    const auto lines = viewLines(state, 1, {24, 60});
    EXPECT_EQ(lines.back(), "last errors   0:00:00 ago  start: x ... xxxxxxxxxxxx the end");
    EXPECT_THAT(lines.back(), SizeIs(60));
}

TEST(View, ARepeatedErrorIsCounted) {
    ViewState state = running();
    for (int i = 0; i < 40; ++i) {
        update(state, failureEvent("a", "b"), i);
    }
    EXPECT_EQ(viewLines(state, 40, roomy).back(), "last errors   40 times, 0:00:01 ago  a: b");
}

TEST(View, TheEndOfTheDaemonStaysTheCause) {
    ViewState state = following();
    update(state, daemonEndedEvent({12, false, 3}, {"bad option"}), 8);
    update(state, qualityEvent(unusable.data(), "Unable to communicate"), 9);
    update(state, qualityEvent(unusable.data(), "PTP sub process has died unexpectedly"), 10);
    update(state, qualityEvent(unusable.data(), "Unable to communicate"), 11);
    EXPECT_EQ(
        viewLines(state, 12, roomy)[1],
        "quality       unusable for 0:00:03: ptp4l, process 12, ended with status 3; its last "
        "words: bad option");
    EXPECT_EQ(state.problems.back().text, "unusable: Unable to communicate");
    EXPECT_EQ(state.problems.size(), 2U);
}

TEST(View, WhatIsExpectedIsNotShown) {
    ViewState state = following();
    const auto before = viewLines(state, 8, roomy);
    update(state, expectedEvent(qualityEvent(unusable.data(), "died")), 8);
    update(state, expectedEvent(metadataEvent(Json{{"gmClockId", "0"}})), 8);
    EXPECT_EQ(viewLines(state, 8, roomy), before);
}

TEST(View, TheHealthStandsAboveAllAndItsReasonWhenNotAllIsWell) {
    ViewState state = following();
    update(state, healthEvent("locked", "time pairs arrive", "starting", 6), 6);
    EXPECT_EQ(viewLines(state, 8, roomy)[0], "IEEE 1588-2008 BC, locked, up 0:00:08");
    EXPECT_THAT(viewLines(state, 8, roomy), Not(Contains(StartsWith("health"))));
    update(state, healthEvent("lost", "no grandmaster is heard", "locked", 4), 10);
    EXPECT_EQ(viewLines(state, 15, roomy)[0], "IEEE 1588-2008 BC, lost, up 0:00:15");
    EXPECT_EQ(viewLines(state, 15, roomy)[1],
              "health        lost for 0:00:05: no grandmaster is heard");
}

TEST(View, ARestartForgetsTheSessionAndKeepsThePairs) {
    ViewState state = following();
    update(state, daemonEndedEvent({12, false, 3}, {}), 8);
    update(state, stoppingEvent("restart"), 8);
    update(state, stoppedEvent(), 8);
    update(state, restartEvent("ptp4l ended", 2, 3), 8);
    auto lines = viewLines(state, 9, roomy);
    EXPECT_EQ(lines[0], "IEEE 1588-2008 BC, restarting, up 0:00:09, 3 restarts");
    EXPECT_EQ(lines[1], "quality       none yet");
    EXPECT_EQ(lines[2], "grandmaster   none yet");
    EXPECT_THAT(lines, Contains("pairs         2"));
    update(state, startedEvent(), 10);
    update(state, qualityEvent(unusable.data(), "PTP sub process has died unexpectedly"), 11);
    EXPECT_EQ(viewLines(state, 11, roomy)[1],
              "quality       unusable for 0:00:00: PTP sub process has died unexpectedly");
}

TEST(View, PairsThatWereLeftOutAreCountedByTheirReason) {
    ViewState state = following();
    update(state, pairEvent(3000, 3000, 0, PairKind::of1970), 8);
    update(state, pairEvent(3000, 3004, 4, PairKind::jump), 9);
    update(state, pairEvent(3000, 3005, 5, PairKind::jump), 9);
    EXPECT_THAT(viewLines(state, 9, roomy),
                Contains("pairs         5, 3 left out: 1970 1, jump 2"));
}

TEST(View, AUsableQualityWithoutPairsGetsAHint) {
    ViewState state = running();
    update(state, qualityEvent(usable.data(), "PTP role has changed."), 5);
    EXPECT_THAT(viewLines(state, 10, roomy), Not(Contains(StartsWith("hint"))));
    EXPECT_EQ(
        viewLines(state, 11, roomy)[7],
        "hint          no time pairs though the quality is usable: no epoch FIFO? Or, in ptp4l's "
        "log, \"SYNC without timestamp\"?");
}

TEST(View, MetadataWithoutTheUsualMembersIsShownToo) {
    ViewState state = running();
    update(state, metadataEvent(Json{{"Port1", Json::object()}}), 1);
    const auto lines = viewLines(state, 1, roomy);
    EXPECT_EQ(lines[2], "grandmaster   ?, class ?, ?");
    EXPECT_EQ(lines[7], "ports         Port1   ?                 ?");
}

TEST(View, OffsetsHaveUnitsThatFit) {
    EXPECT_EQ(shownOffset(0), "0 ns");
    EXPECT_EQ(shownOffset(-917), "-917 ns");
    EXPECT_EQ(shownOffset(9999), "9999 ns");
    EXPECT_EQ(shownOffset(10000), "10.000 us");
    EXPECT_EQ(shownOffset(9999999), "9999.999 us");
    EXPECT_EQ(shownOffset(-10000000), "-10.000 ms");
    EXPECT_EQ(shownOffset(1e10), "10.000 s");
    EXPECT_EQ(shownOffset(-9.223372036854775807e18), "-9223372036.855 s");
}
