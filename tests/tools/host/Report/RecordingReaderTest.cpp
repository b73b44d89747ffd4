#include "Report/RecordingReader.h"

#include <sstream>

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "UsageError.h"

using namespace vantelhost;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;

namespace {

/// Of files with these texts: x.jsonl, y.jsonl, z.jsonl.
Recording readAll(const std::vector<std::string>& texts) {
    RecordingReader reader;
    char name = 'x';
    for (const auto& text : texts) {
        std::istringstream stream(text);
        reader.read(stream, name++ + std::string(".jsonl"));
    }
    return reader.finish();
}

Recording read(const std::string& text) {
    return readAll({text});
}

std::vector<double> valuesOf(const Series& series) {
    std::vector<double> values;
    for (const auto& point : series.points()) {
        values.push_back(point.y);
    }
    return values;
}

std::vector<std::string> gapsOf(const Recording& recording) {
    std::vector<std::string> gaps;
    for (const auto& gap : recording.gaps.items()) {
        gaps.push_back(fmt::format("{}+{}: {}", gap.seconds, gap.length, gap.text));
    }
    return gaps;
}

/// What is said about text that is no record.
std::string complaint(const std::string& text) {
    try {
        read(text);
    } catch (const UsageError& error) {
        return error.what();
    }
    return "";
}

/// A line of a host that was started at a time, in seconds.
std::string lineOf(double start, const std::string& event, double seconds,
                   const std::string& members = "") {
    Json object{{"event", event},
                {"t", seconds},
                {"time", static_cast<std::uint64_t>((start + seconds) * 1e9)}};
    object.update(Json::parse("{" + members + "}"));
    return object.dump() + "\n";
}

/// Of one that was started at 1000 s.
std::string line(const std::string& event, double seconds, const std::string& members = "") {
    return lineOf(1000, event, seconds, members);
}

const std::string named = R"("name":"n","library":"l")";

/// A pair that is found at once.
std::string pairAt(double start, double seconds, int offset) {
    const auto local = static_cast<std::uint64_t>((start + seconds) * 1e9);
    return lineOf(start, "pair", seconds,
                  fmt::format(R"("local":{},"reference":{},"offset":{})", local,
                              local - static_cast<std::uint64_t>(offset), offset));
}

/// The first line of a part of a run, with what was told before.
std::string continued(double seconds, int part, const std::string& before = "",
                      double start = 1000) {
    return lineOf(start, "continued", seconds,
                  fmt::format(R"("begin":{},"part":{},"before":[{}])",
                              static_cast<std::uint64_t>(start * 1e9), part, before));
}

std::string ports(double seconds, const std::string& metadata) {
    return line("metadata", seconds, R"("valid":true,"metadata":)" + metadata);
}

} // namespace

TEST(RecordingReader, NothingIsAnEmptyRecording) {
    const auto recording = read("");
    EXPECT_EQ(recording.lines, 0U);
    EXPECT_FALSE(recording.truncated);
}

TEST(RecordingReader, KnowsBeginAndEnd) {
    const auto recording = read(line("loaded", 0.5, R"("name":"n","library":"l")") +
                                line("stopping", 7, R"("cause":"SIGTERM")") + line("summary", 8));
    EXPECT_EQ(recording.begin, 1000000000000U);
    EXPECT_EQ(recording.duration, 8);
    EXPECT_EQ(recording.plugIn, "n");
    EXPECT_EQ(recording.stopCause, "SIGTERM");
    EXPECT_TRUE(recording.summarised);
}

TEST(RecordingReader, DelayIsFromTheIngressWithoutTheEpochOffset) {
    const auto recording =
        read(line("pair", 1, R"("reference":5,"local":1000900000000,"offset":-5)") +
             line("epoch-offset", 1.5, R"("offset":37000000000)") +
             line("pair", 2, R"("reference":5,"local":1038800000000,"offset":6)"));
    EXPECT_THAT(valuesOf(recording.pairs->offsets()), ElementsAre(-5, 6));
    EXPECT_THAT(valuesOf(recording.pairs->delays()), ElementsAre(100000000, 200000000));
    EXPECT_THAT(valuesOf(recording.pairs->intervals()), ElementsAre(900000000));
}

TEST(RecordingReader, PairsThatAreNoMeasurementsAreCountedOnly) {
    const std::string usable = R"("quality":"usable","reason":"PTP role has changed.")";
    const std::string unusable = R"("quality":"unusable","reason":"PTP role has changed.")";
    const auto recording =
        read(line("quality", 1, usable) +
             line("pair", 1, R"("reference":1001000000000,"local":1001000000000,"offset":0)") +
             line("pair", 2, R"("reference":1001999999993,"local":1002000000000,"offset":7)") +
             line("quality", 3, unusable) +
             line("pair", 3, R"("reference":18446744073709551609,"local":0,"offset":7)") +
             line("quality", 4, usable) +
             line("pair", 4, R"("reference":1003999999993,"local":1004000000000,"offset":7)") +
             line("pair", 5, R"("reference":1004999999992,"local":1005000000000,"offset":8)"));
    EXPECT_THAT(valuesOf(recording.pairs->offsets()), ElementsAre(7, 8));
    EXPECT_EQ(recording.counts.measured, 2U);
    EXPECT_EQ(recording.counts.of1970, 1U);
    EXPECT_EQ(recording.counts.falseOffsets, 2U);
}

TEST(RecordingReader, WithOnlyZerosTheTimesOfPairsAreKept) {
    const auto recording =
        read(line("pair", 1, R"("reference":1001000000000,"local":1001000000000,"offset":0)") +
             line("pair", 2, R"("reference":0,"local":0,"offset":0)") +
             line("pair", 3, R"("reference":1003000000000,"local":1003000000000,"offset":0)"));
    EXPECT_EQ(recording.pairs->delays().points().size(), 2U);
    EXPECT_TRUE(recording.counts.onlyZeros());
}

TEST(RecordingReader, QualityThatIsRepeatedIsNoChange) {
    const std::string good = R"("quality":"usable","reason":"a")";
    const auto recording = read(line("quality", 1, good) + line("quality", 2, good) +
                                line("quality", 3, R"("quality":"usable","reason":"b")"));
    ASSERT_EQ(recording.qualities.count(), 2U);
    EXPECT_EQ(recording.qualities.items()[1].reason, "b");
    EXPECT_EQ(recording.qualities.items()[1].seconds, 3);
}

TEST(RecordingReader, PortsComeChangeAndGo) {
    const auto recording =
        read(ports(1, R"({"a":1,"Port1":{"portState":"PTP_LISTENING","interface":"eth0"}})") +
             ports(2, R"({"a":2,"Port1":{"portState":"PTP_LISTENING","interface":"eth0"}})") +
             ports(3, R"({"a":2,"Port1":{"portState":"PTP_SLAVE","interface":"eth0"}})") +
             ports(4, R"({"a":3})"));
    const auto& changes = recording.portChanges.items();
    ASSERT_EQ(changes.size(), 3U);
    EXPECT_EQ(changes[0].port, "Port1 eth0");
    EXPECT_EQ(changes[0].state, "PTP_LISTENING");
    EXPECT_EQ(changes[1].seconds, 3);
    EXPECT_EQ(changes[1].state, "PTP_SLAVE");
    EXPECT_EQ(changes[2].seconds, 4);
    EXPECT_EQ(changes[2].state, "");
    EXPECT_EQ(recording.metadata["a"], 3);
}

TEST(RecordingReader, ProblemsAreCountedByKind) {
    const auto recording =
        read(line("error", 1, R"("operation":"start","code":-52000,"status":{"a":1})") +
             line("error", 2, R"("operation":"fifo","problem":"gone")") +
             line("warning", 3, R"("operation":"stop","code":1,"status":"")") +
             line("refused", 4, R"("function":"zekel_getTime")") +
             line("metadata", 5, R"("valid":false,"text":"no")"));
    EXPECT_EQ(recording.errors, 3U);
    EXPECT_EQ(recording.warnings, 1U);
    EXPECT_EQ(recording.refused, 1U);
    const auto& problems = recording.problems.items();
    ASSERT_EQ(problems.size(), 5U);
    EXPECT_EQ(problems[0].text, R"(start: -52000: {"a":1})");
    EXPECT_EQ(problems[1].text, "fifo: gone");
    EXPECT_EQ(problems[3].text, "zekel_getTime");
}

TEST(RecordingReader, ADaemonThatEndedIsAProblemWithItsLastWords) {
    const auto recording =
        read(line("daemon-ended", 1, R"("pid":71,"status":3,"words":["one","bad option"])") +
             line("daemon-ended", 2, R"("pid":72,"signal":9,"words":[])"));
    EXPECT_EQ(recording.errors, 0U);
    const auto& problems = recording.problems.items();
    ASSERT_EQ(problems.size(), 2U);
    EXPECT_EQ(problems[0].kind, "daemon-ended");
    EXPECT_EQ(problems[0].text,
              "ptp4l, process 71, ended with status 3; its last words: one / bad option");
    EXPECT_EQ(problems[1].text, "ptp4l, process 72, was ended by SIGKILL, without a word");
}

TEST(RecordingReader, TheCauseOfARunInVainIsAnErrorThatItsMendFollows) {
    const auto recording =
        read(line("cause", 1, R"("text":"no time pair came")") + line("mend", 1, R"("text":"x")"));
    EXPECT_EQ(recording.cause, "no time pair came");
    EXPECT_EQ(recording.mend, "x");
    EXPECT_EQ(recording.errors, 1U);
    const auto& problems = recording.problems.items();
    ASSERT_EQ(problems.size(), 2U);
    EXPECT_EQ(problems[0].kind, "cause");
    EXPECT_EQ(problems[0].text, "no time pair came");
    EXPECT_EQ(problems[1].kind, "mend");
    EXPECT_EQ(problems[1].text, "x");
}

TEST(RecordingReader, OfThousandsOnlyTheFirstAreKept) {
    std::string text;
    for (int i = 0; i < 5002; ++i) {
        text += line("quality", i, R"("quality":"usable","reason":")" + std::to_string(i) + "\"");
    }
    const auto recording = read(text);
    EXPECT_EQ(recording.qualities.count(), 5002U);
    EXPECT_EQ(recording.qualities.items().size(), 5000U);
    EXPECT_EQ(recording.qualities.fullSince(), 5000.0);
}

TEST(RecordingReader, ACutLastLineIsLeftOut) {
    const std::string text = line("started", 1) + line("stopped", 2);
    for (std::size_t cut = 1; cut < line("stopped", 2).size() - 1; ++cut) {
        const auto recording = read(text.substr(0, text.size() - 1 - cut));
        EXPECT_TRUE(recording.truncated);
        EXPECT_EQ(recording.lines, 1U);
    }
}

TEST(RecordingReader, AWholeLastLineWithoutItsEndCounts) {
    const std::string text = line("started", 1);
    const auto recording = read(text.substr(0, text.size() - 1));
    EXPECT_FALSE(recording.truncated);
    EXPECT_EQ(recording.lines, 1U);
}

TEST(RecordingReader, UnknownEventsAndMembersArePassedOver) {
    EXPECT_EQ(read(line("new", 1, R"("new":[])")).lines, 1U);
}

TEST(RecordingReader, WhatIsNoRecordIsNamedWithItsFirstLine) {
    EXPECT_THAT(complaint("hello\n" + line("new", 1).substr(1)),
                StartsWith("x.jsonl:1: this is no record of vantel-host: "));
}

TEST(RecordingReader, GarbageBetweenLinesIsLeftOutAndNamedWithItsLine) {
    const std::string good = line("started", 5);
    for (const std::string& bad : {
             std::string("hello\n"),
             std::string("\n"),
             std::string("[]\n"),
             std::string("{}\n"),
             std::string("\0\n", 2),
             std::string(2000000, 'x') + "\n",
             std::string("{\"event\":\"\xFF\"}\n"),
             std::string(R"({"event":"pair","t":6,"time":1})") + "\n",
             std::string(R"({"event":"started","t":"6","time":1})") + "\n",
             line("started", 4),
             line("started", 1e300 / 1e290),
             line("quality", 5, R"("quality":5,"reason":"")"),
             line("daemon-ended", 5, R"("pid":1,"words":[])"),
             good.substr(0, 20) + "\n",
         }) {
        const auto recording = read(good + bad + good);
        EXPECT_EQ(recording.lines, 2U) << bad;
        ASSERT_EQ(recording.gaps.count(), 1U) << bad;
        EXPECT_THAT(gapsOf(recording)[0], StartsWith("5+0: x.jsonl:2: this line is no event: "))
            << bad;
    }
}

TEST(RecordingReader, ManyLinesWithoutAnEventAreNotReadToTheirEnd) {
    std::string text;
    for (int i = 0; i < 1000; ++i) {
        text += "hello\n";
    }
    EXPECT_THAT(complaint(text + line("started", 1)), StartsWith("x.jsonl:1: this is no record"));
}

TEST(RecordingReader, RunsInOneFileFollowEachOtherInTheHostsClock) {
    const auto recording = read(line("loaded", 1, named) + pairAt(1000, 2, 5) + line("summary", 3) +
                                lineOf(2000, "loaded", 1, named) + pairAt(2000, 4, 6));
    EXPECT_EQ(recording.runs, 2U);
    EXPECT_EQ(recording.files, 1U);
    EXPECT_EQ(recording.begin, 1000000000000U);
    EXPECT_EQ(recording.duration, 1004);
    EXPECT_FALSE(recording.summarised);
    EXPECT_THAT(gapsOf(recording), ElementsAre("3+998: another run begins"));
    const auto& points = recording.pairs->offsets().points();
    ASSERT_EQ(points.size(), 2U);
    EXPECT_EQ(points[0].x, 2);
    EXPECT_EQ(points[1].x, 1004);
    EXPECT_TRUE(recording.pairs->intervals().points().empty());
}

TEST(RecordingReader, ARunThatWasKilledIsToldByTheNextOne) {
    const auto recording =
        readAll({line("loaded", 1, named) + "{\"event\":\"pa",
                 lineOf(1010, "loaded", 1, named) + lineOf(1010, "summary", 20)});
    EXPECT_FALSE(recording.truncated);
    EXPECT_EQ(recording.files, 2U);
    EXPECT_THAT(gapsOf(recording),
                ElementsAre("1+0: x.jsonl:2: the last line is cut",
                            "1+10: another run begins; the one before has no summary: it was "
                            "killed"));
}

TEST(RecordingReader, ACutLineBetweenRunsSpoilsOnlyItself) {
    const auto recording = read(line("loaded", 1, named) + "{\"event\":\"pa\n" +
                                lineOf(1010, "loaded", 1, named) + pairAt(1010, 2, 6));
    EXPECT_EQ(recording.lines, 3U);
    EXPECT_EQ(recording.runs, 2U);
    EXPECT_EQ(recording.counts.measured, 1U);
}

TEST(RecordingReader, ARunBeforeTheOneBeforeFollowsAtOnce) {
    const auto recording = readAll({lineOf(9000, "loaded", 1, named) + lineOf(9000, "summary", 3),
                                    line("loaded", 1, named) + line("summary", 3)});
    EXPECT_THAT(gapsOf(recording),
                ElementsAre("3+0: another run begins; the host's clock was set back by 133 min, or "
                            "the files are out of order"));
    EXPECT_EQ(recording.duration, 5);
}

TEST(RecordingReader, AClockThatIsSetWithinARunIsToldAndChangesNoTime) {
    const std::string later = lineOf(4600, "started", 3);
    const auto recording = read(line("loaded", 1, named) + line("started", 2) + later +
                                lineOf(1000.5, "started", 4) + lineOf(1000, "stopped", 5));
    EXPECT_EQ(recording.runs, 1U);
    EXPECT_EQ(recording.duration, 5);
    EXPECT_THAT(gapsOf(recording),
                ElementsAre("3+0: the host's clock was set forward by 60 min, or the machine slept",
                            "4+0: the host's clock was set back by 60 min"));
}

TEST(RecordingReader, PartsOfARunAreOne) {
    const auto recording =
        readAll({line("loaded", 1, named) + pairAt(1000, 2, 5),
                 continued(2.1, 1) + pairAt(1000, 3, 6), continued(3.1, 2) + pairAt(1000, 4, 9)});
    EXPECT_EQ(recording.files, 3U);
    EXPECT_EQ(recording.runs, 1U);
    EXPECT_EQ(recording.gaps.count(), 0U);
    EXPECT_THAT(valuesOf(recording.pairs->offsets()), ElementsAre(5, 6, 9));
    EXPECT_THAT(valuesOf(recording.pairs->intervals()), ElementsAre(1000000000, 1000000000));
}

TEST(RecordingReader, AMissingPartIsAGapAndWhatWasToldBeforeHolds) {
    const std::string before =
        R"({"event":"epoch-offset","offset":1000000000},)"
        R"({"event":"quality","quality":"usable","reason":"a"},)"
        R"({"event":"health","state":"locked","reason":"b","before":"starting","spent":9},)"
        R"({"event":"metadata","valid":true,"metadata":{"Port1":{"portState":"PTP_SLAVE"}}})";
    const auto recording = readAll({line("loaded", 1, named) +
                                        line("quality", 1, R"("quality":"unusable","reason":"c")") +
                                        pairAt(1000, 2, 5),
                                    continued(12, 3, before) + pairAt(1000, 13, 6)});
    EXPECT_EQ(recording.runs, 1U);
    EXPECT_THAT(gapsOf(recording), ElementsAre("2+10: 2 of the run's files are missing"));
    EXPECT_EQ(recording.epochOffset, 1000000000);
    EXPECT_EQ(recording.epochOffsets, 0U);
    const auto& qualities = recording.qualities.items();
    ASSERT_EQ(qualities.size(), 3U);
    EXPECT_EQ(qualities[1].seconds, 2);
    EXPECT_EQ(qualities[1].state, "");
    EXPECT_EQ(qualities[2].seconds, 12);
    EXPECT_EQ(qualities[2].state, "usable");
    EXPECT_EQ(recording.qualities.count(), 2U);
    EXPECT_EQ(recording.portChanges.items().at(0).state, "PTP_SLAVE");
    EXPECT_TRUE(recording.pairs->intervals().points().empty());
    EXPECT_EQ(valuesOf(recording.pairs->delays()).at(1), 1000000000);
}

TEST(RecordingReader, ARecordMayBeginInTheMiddleOfARun) {
    const auto recording =
        read(continued(86400, 4, R"({"event":"loaded","name":"n","library":"l"})") +
             pairAt(1000, 86401, 6));
    EXPECT_THAT(gapsOf(recording), ElementsAre("0+0: 4 of the run's files are missing"));
    EXPECT_EQ(recording.duration, 1);
    EXPECT_EQ(recording.begin, 87400000000000U);
    EXPECT_EQ(recording.plugIn, "n");
}

TEST(RecordingReader, PartsStandWhereTheMonotonicClockPutsThem) {
    // The host's clock is set back by an hour between the parts.
    const auto recording =
        readAll({line("loaded", 1, named) + line("started", 100),
                 lineOf(-2600, "continued", 3700, R"("begin":1000000000000,"part":1,"before":[])") +
                     lineOf(-2600, "stopped", 3701)});
    EXPECT_EQ(recording.duration, 3701);
    EXPECT_THAT(gapsOf(recording), ElementsAre("3700+0: the host's clock was set back by 60 min"));
}

TEST(RecordingReader, AFileThatSomebodyElseHasCutGoesOn) {
    const auto recording = readAll({line("loaded", 1, named), line("started", 2)});
    EXPECT_EQ(recording.runs, 1U);
    EXPECT_EQ(recording.gaps.count(), 0U);
}

TEST(RecordingReader, EmptyFilesBetweenOthersAreNoHarm) {
    const auto recording = readAll({"", line("loaded", 1, named), ""});
    EXPECT_EQ(recording.files, 3U);
    EXPECT_EQ(recording.lines, 1U);
    EXPECT_EQ(recording.gaps.count(), 0U);
}

TEST(RecordingReader, LostEventsAreAGapBeforeTheyAreTold) {
    const auto recording =
        read(line("loaded", 1, named) + pairAt(1000, 2, 5) + pairAt(1000, 9, 6) +
             line("lost", 9, R"("events":40,"seconds":6.5,"problem":"No space left on device")"));
    EXPECT_THAT(gapsOf(recording),
                ElementsAre("2.5+6.5: 40 events could not be written: No space left on device"));
}

TEST(RecordingReader, ARestartedSessionBeginsWithoutADelayAndWithoutAnEpochOffset) {
    const auto recording =
        read(line("loaded", 1, named) + line("epoch-offset", 1, R"("offset":7)") +
             pairAt(1000, 2, 5) + line("stopping", 3, R"("cause":"restart")") +
             line("restart", 3, R"("cause":"ptp4l has ended","delay":1,"restarts":1)") +
             line("initialised", 4, R"("configuration":{"a":1})") + line("started", 4) +
             pairAt(1000, 5, 0) + pairAt(1000, 6, 4));
    EXPECT_EQ(recording.runs, 1U);
    EXPECT_EQ(recording.restarts, 1U);
    EXPECT_EQ(recording.stopCause, "");
    EXPECT_EQ(recording.counts.falseOffsets, 1U);
    EXPECT_EQ(recording.epochOffset, 0);
    EXPECT_THAT(valuesOf(recording.pairs->offsets()), ElementsAre(5, 4));
    ASSERT_EQ(recording.problems.items().size(), 1U);
    EXPECT_EQ(recording.problems.items()[0].kind, "restart");
    EXPECT_EQ(recording.problems.items()[0].text, "ptp4l has ended");
}

TEST(RecordingReader, TheHostsOwnJudgementOfAPairCounts) {
    const auto recording =
        read(line("loaded", 1, named) +
             line("pair", 2, R"("local":5,"reference":0,"offset":5,"leftOut":"no-delay")") +
             line("pair", 3, R"("local":6,"reference":0,"offset":6,"leftOut":"1970")") +
             line("pair", 4, R"("local":7,"reference":0,"offset":7)") +
             line("pair", 5, R"("local":8,"reference":0,"offset":8,"leftOut":"jump")") +
             line("pair", 6, R"("local":9,"reference":0,"offset":9,"leftOut":"return")") +
             line("pair", 7, R"("local":10,"reference":0,"offset":10,"leftOut":"same")") +
             line("pair", 8, R"("local":11,"reference":0,"offset":11,"leftOut":"health")"));
    EXPECT_EQ(recording.counts.falseOffsets, 1U);
    EXPECT_EQ(recording.counts.of1970, 1U);
    EXPECT_EQ(recording.counts.distrusted, 3U);
    EXPECT_EQ(recording.counts.all(), 7U);
    EXPECT_THAT(valuesOf(recording.pairs->offsets()), ElementsAre(7, 11));
}

TEST(RecordingReader, HealthBeginsWithTheStateBeforeTheFirstOneTold) {
    const auto recording =
        read(line("loaded", 1, named) +
             line("health", 5, R"("state":"locked","reason":"r","before":"starting","spent":3.5)") +
             line("health", 9, R"("state":"stale","reason":"s","before":"locked","spent":4)"));
    const auto& healths = recording.healths.items();
    ASSERT_EQ(healths.size(), 3U);
    EXPECT_EQ(healths[0].state, "starting");
    EXPECT_EQ(healths[0].seconds, 1.5);
    EXPECT_EQ(healths[1].state, "locked");
    EXPECT_EQ(healths[2].reason, "s");
}

TEST(RecordingReader, AnEndlessLineIsNone) {
    EXPECT_THAT(complaint(std::string(3000000, 'x')), HasSubstr("x.jsonl:1: "));
    EXPECT_THAT(complaint(std::string(3000000, 'x')), HasSubstr("the line is too long"));
}

TEST(RecordingReader, DeepNestingIsNone) {
    const std::string deep = std::string(500000, '[') + std::string(500000, ']');
    EXPECT_THAT(complaint(R"({"event":"new","t":1,"time":1,"x":)" + deep + "}\n"),
                HasSubstr("nested too deep"));
}
