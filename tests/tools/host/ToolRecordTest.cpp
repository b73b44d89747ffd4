// What a run leaves in the record and hands to chronyd.

#include <csignal>
#include <ctime>
#include <sstream>

#include <sys/stat.h>

#include "Tool.h"
#include "support/Child.h"

using testing::HasSubstr;
using vantelhost::Json;

namespace {

class ToolRecordTest : public ToolTest {
protected:
    Result recorded() const { return {0, contentOf(file), ""}; }

    std::string file = folder.path("run.jsonl");
};

} // namespace

TEST_F(ToolRecordTest, HasTheLinesOfTheJsonOutput) {
    const auto result = play("quality pairs metadata bad-metadata", {"--record", file});
    EXPECT_EQ(contentOf(file), result.output);
    EXPECT_EQ(recorded().events("pair").size(), 3U);
    EXPECT_EQ(recorded().events().back()["event"], "summary");
}

TEST_F(ToolRecordTest, IsTheSameWithReadableOutput) {
    ASSERT_EQ(run({"--interface", "eth0", "--seconds", "0", "--set", "script=pairs metadata",
                   "--record", file})
                  .status,
              0);
    EXPECT_EQ(recorded().events("pair").at(0)["reference"], 1000);
    EXPECT_EQ(recorded().events("metadata").at(0)["metadata"]["gmClockClass"], 6);
}

TEST_F(ToolRecordTest, EveryLineHasTheMomentInBothClocks) {
    const auto before = std::time(nullptr);
    play("pairs", {"--record", file});
    const auto events = recorded().events();
    double last = 0;
    for (const auto& event : events) {
        const double seconds = event["time"].get<double>() / 1e9;
        EXPECT_GE(seconds, static_cast<double>(before));
        EXPECT_LE(seconds, static_cast<double>(std::time(nullptr) + 1));
        EXPECT_GE(event["t"].get<double>(), last);
        last = event["t"].get<double>();
    }
}

TEST_F(ToolRecordTest, AKilledHostLosesNothing) {
    Child child(command(
        {"--json", "--interface", "eth0", "--set", "script=quality pairs", "--record", file}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"started\""));
    child.signal(SIGKILL);
    EXPECT_EQ(child.wait(), 1000 + SIGKILL);
    EXPECT_EQ(recorded().events("pair").size(), 3U);
    EXPECT_EQ(contentOf(file).back(), '\n');
}

TEST_F(ToolRecordTest, AnOldFileIsReplaced) {
    writeFile(file, "old\n");
    play("", {"--record", file});
    EXPECT_EQ(recorded().events().at(0)["event"], "loaded");
}

TEST_F(ToolRecordTest, AnOldFileIsKeptWhenAppending) {
    writeFile(file, "cut");
    play("", {"--record", file, "--record-append"});
    play("pairs", {"--record", file, "--record-append"});
    const auto content = contentOf(file);
    EXPECT_THAT(content, testing::StartsWith("cut\n{\"event\":\"loaded\""));
    const Result result{0, content.substr(4), ""};
    EXPECT_EQ(result.events("loaded").size(), 2U);
    EXPECT_EQ(result.events("summary").size(), 2U);
    EXPECT_EQ(result.events("pair").size(), 3U);
}

TEST_F(ToolRecordTest, AFullFileBecomesAnOldOne) {
    const auto result = play("quality pairs metadata bad-metadata",
                             {"--record", file, "--record-size", "1K", "--record-keep", "20"});
    std::string all;
    for (int number = 20; number >= 0; --number) {
        all += contentOf(number == 0 ? file : file + "." + std::to_string(number));
    }
    std::string lines;
    std::istringstream stream(all);
    for (std::string line; std::getline(stream, line);) {
        lines += line.find("{\"event\":\"continued\"") == 0 ? "" : line + "\n";
    }
    EXPECT_EQ(lines, result.output);
    EXPECT_NE(contentOf(file + ".1"), "");
}

TEST_F(ToolRecordTest, OptionsWithoutARecordAreMistakes) {
    EXPECT_EQ(play("", {"--record-append"}).status, 2);
    EXPECT_EQ(play("", {"--record-size", "1K"}).status, 2);
    EXPECT_EQ(play("", {"--record", file, "--record-keep", "3"}).status, 2);
    EXPECT_EQ(play("", {"--record", file, "--record-size", "1X"}).status, 2);
    EXPECT_EQ(play("", {"--record", file, "--record-size", "1K", "--record-keep", "1000"}).status,
              2);
    EXPECT_EQ(contentOf(file), "");
}

TEST_F(ToolRecordTest, AFileThatAnotherRunWritesIsLeftAlone) {
    Child first(command({"--interface", "eth0", "--record", file}));
    ASSERT_TRUE(first.waitForOutput("started"));
    const auto result = play("", {"--record", file});
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.errors, "vantel-host: cannot write " + file + ": somebody else writes it\n");
    EXPECT_EQ(recorded().events().at(0)["event"], "loaded");
}

TEST_F(ToolRecordTest, AMistakeLeavesAnOldFileAsItWas) {
    writeFile(file, "old\n");
    const auto result = play("", {"--record", file, "--set", "count=x"});
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(contentOf(file), "old\n");
}

TEST_F(ToolRecordTest, AnUnwritablePathIsAMistake) {
    const auto result = play("", {"--record", folder.path("none/run.jsonl")});
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.errors, "vantel-host: cannot write " + folder.path("none/run.jsonl") +
                                 ": No such file or directory\n");
    EXPECT_TRUE(record().empty());
}

TEST_F(ToolRecordTest, AFullDiskAtTheStartIsToldAndTheRunGoesOn) {
    const auto result = play("pairs", {"--record", "/dev/full"});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.events("pair").size(), 3U);
    EXPECT_EQ(result.events("error").at(0)["operation"], "record /dev/full");
    EXPECT_EQ(result.events("error").at(0)["problem"], "No space left on device");
}

TEST_F(ToolRecordTest, AFileThatFillsLaterIsToldOnceAndTheRunGoesOn) {
    // A pipe whose reader goes away after the first events.
    const std::string pipe = folder.path("pipe");
    ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
    Child reader({"/bin/sh", "-c", "head -n 3 " + pipe});
    const auto result =
        play("pairs", {"--record", pipe, "--create-fifo", "--fifo", folder.path("epoch"),
                       "--epoch-offset-at", "0:1", "--seconds", "1"});
    EXPECT_EQ(reader.wait(), 0);
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.events("stopping").at(0)["cause"], "duration");
    ASSERT_EQ(result.events("error").size(), 1U);
    EXPECT_EQ(result.events("error")[0]["problem"], "Broken pipe");
    EXPECT_EQ(ToolTest::record().back(), "finalise");
}

TEST_F(ToolRecordTest, WithoutChronydTheRunFailsAndSaysSoOnceAndAtTheEnd) {
    const auto result = play("role timely", {"--chrony", folder.path("none")});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.events("cause").at(0)["text"].get<std::string>(),
                HasSubstr("No such file or directory; 0 sent, 3 failed"));
    EXPECT_EQ(result.events("mend").at(0)["text"],
              "start chronyd with \"refclock SOCK\" and that path");
    const auto told = result.events("chrony");
    ASSERT_EQ(told.size(), 2U);
    EXPECT_EQ(told[0]["reachable"], false);
    EXPECT_EQ(told[1]["failed"], 3);
    EXPECT_EQ(told[1]["sent"], 0);
}
