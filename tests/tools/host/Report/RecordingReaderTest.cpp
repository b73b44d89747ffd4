#include "Report/RecordingReader.h"

#include <sstream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "UsageError.h"

using namespace vantelhost;
using testing::HasSubstr;
using testing::StartsWith;

namespace {

Recording read(const std::string& text) {
    std::istringstream stream(text);
    return RecordingReader::read(stream, "x.jsonl");
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

/// A line of a host that was started at 1000 s.
std::string line(const std::string& event, double seconds, const std::string& members = "") {
    Json object{{"event", event},
                {"t", seconds},
                {"time", static_cast<std::uint64_t>((1000 + seconds) * 1e9)}};
    object.update(Json::parse("{" + members + "}"));
    return object.dump() + "\n";
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
    ASSERT_EQ(recording.pairs.size(), 2U);
    EXPECT_EQ(recording.pairs[0].delay, 100000000);
    EXPECT_EQ(recording.pairs[0].offset, -5);
    EXPECT_EQ(recording.pairs[1].ingress, 1001800000000U);
    EXPECT_EQ(recording.pairs[1].delay, 200000000);
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
    ASSERT_EQ(recording.pairs.size(), 2U);
    EXPECT_EQ(recording.pairs[0].offset, 7);
    EXPECT_EQ(recording.pairs[1].offset, 8);
    EXPECT_EQ(recording.counts.measured, 2U);
    EXPECT_EQ(recording.counts.of1970, 1U);
    EXPECT_EQ(recording.counts.falseOffsets, 2U);
}

TEST(RecordingReader, WithOnlyZerosTheTimesOfPairsAreKept) {
    const auto recording =
        read(line("pair", 1, R"("reference":1001000000000,"local":1001000000000,"offset":0)") +
             line("pair", 2, R"("reference":0,"local":0,"offset":0)") +
             line("pair", 3, R"("reference":1003000000000,"local":1003000000000,"offset":0)"));
    EXPECT_EQ(recording.pairs.size(), 2U);
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

TEST(RecordingReader, WhatIsNoRecordIsNamedWithItsLine) {
    const std::string good = line("started", 5);
    const auto prefix = std::string("x.jsonl:2: this is no record of vantel-host: ");
    for (const std::string& bad : {
             std::string("hello\n"),
             std::string("\n"),
             std::string("[]\n"),
             std::string("{}\n"),
             std::string("\0\n", 2),
             std::string("{\"event\":\"\xFF\"}\n"),
             std::string(R"({"event":"pair","t":6,"time":1})") + "\n",
             std::string(R"({"event":"started","t":"6","time":1})") + "\n",
             line("started", 4),
             line("started", 1e300 / 1e290),
             line("quality", 6, R"("quality":5,"reason":"")"),
             line("daemon-ended", 6, R"("pid":1,"words":[])"),
         }) {
        EXPECT_THAT(complaint(good + bad + good), StartsWith(prefix)) << bad;
    }
}

TEST(RecordingReader, ASecondRecordingInTheSameFileIsNone) {
    const std::string loaded = line("loaded", 1, R"("name":"n","library":"l")");
    EXPECT_THAT(complaint(loaded + loaded), HasSubstr("x.jsonl:2: "));
    EXPECT_THAT(complaint(loaded + loaded), HasSubstr("another recording begins"));
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
