// Runs that were in vain: what is said, and the exit status.

#include <csignal>

#include "Terminal.h"
#include "Tool.h"
#include "support/Child.h"

using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

namespace {

class ToolFailureTest : public ToolTest {
protected:
    /// A run whose plug-in starts a command of the shell, until an event; then SIGTERM.
    Result runWithChild(const std::string& shell, const std::string& event,
                        const Words& options = {"--json"}) const {
        Words words = command({"--interface", "eth0", "--set", "child=" + shell});
        words.insert(words.end(), options.begin(), options.end());
        Child child(words);
        EXPECT_TRUE(child.waitForOutput(event)) << child.output();
        child.signal(SIGTERM);
        const int status = child.wait();
        return {status, child.output(), child.errors()};
    }
};

} // namespace

TEST_F(ToolFailureTest, ADaemonThatEndsIsToldWithItsStatusAndLastWords) {
    const auto result =
        runWithChild("echo one >&2; echo bad option >&2; exit 3", "\"event\":\"daemon-ended\"");
    EXPECT_EQ(result.status, 1);
    const auto end = result.events("daemon-ended").at(0);
    EXPECT_GT(end["pid"], 0);
    EXPECT_EQ(end["status"], 3);
    EXPECT_EQ(end["words"], vantelhost::Json({"one", "bad option"}));
    EXPECT_THAT(result.events("cause").at(0)["text"].get<std::string>(),
                HasSubstr("ended with status 3; its last words: one / bad option"));
    EXPECT_EQ(result.events("mend").size(), 1U);
    EXPECT_EQ(result.events().back()["event"], "summary");
    EXPECT_EQ(result.events("summary").at(0)["errors"], 1);
    EXPECT_THAT(result.errors, HasSubstr("one\nbad option\n"));
}

TEST_F(ToolFailureTest, ADaemonThatIsKilledIsToldWithTheSignal) {
    const auto result = runWithChild("kill -KILL $$", "\"event\":\"daemon-ended\"");
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.events("daemon-ended").at(0)["signal"], SIGKILL);
    EXPECT_THAT(result.events("cause").at(0)["text"].get<std::string>(),
                HasSubstr("was ended by SIGKILL, without a word"));
}

TEST_F(ToolFailureTest, CauseAndMendAreLinesOfReadableOutput) {
    const auto result = runWithChild("exit 1", "daemon-ended", {"--plain"});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.output, HasSubstr(" cause        ptp4l, process "));
    EXPECT_THAT(result.output, HasSubstr(" mend         \"vantel-host check\" with the same "));
}

TEST_F(ToolFailureTest, ADaemonThatLivesIsNotTold) {
    const auto result = runWithChild("echo hello >&2; exec sleep 1000", "\"event\":\"started\"");
    EXPECT_EQ(result.status, 0);
    EXPECT_TRUE(result.events("daemon-ended").empty());
    EXPECT_TRUE(result.events("cause").empty());
}

TEST_F(ToolFailureTest, WhatADaemonSaysLeavesTheLiveViewAlone) {
    Terminal terminal(command(
        {"--interface", "eth0", "--set", "child=echo spoilt >&2; echo last words >&2; exit 1"}));
    ASSERT_TRUE(terminal.waitForOutput("last words", 2));
    terminal.write("\x03");
    EXPECT_EQ(terminal.wait(), 1);
    EXPECT_THAT(terminal.output(), Not(HasSubstr("spoilt\r\n")));
    EXPECT_THAT(terminal.output(), HasSubstr(" cause        ptp4l, process "));
}

TEST_F(ToolFailureTest, ARunWithTimeForAPairThatGotNoneFails) {
    const std::string fifo = folder.path("none");
    const auto result = run({"--json", "--interface", "eth0", "--set", "logAnnounceInterval=-9",
                             "--fifo", fifo, "--create-fifo", "--seconds", "5.1"});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.events("cause").at(0)["text"], "no time pair came: ptp4l does not answer");
}

TEST_F(ToolFailureTest, OffsetsThatAreAllExactlyZeroFail) {
    const auto result = play("zeros");
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.events("cause").at(0)["text"],
              "offset exactly 0 in 20 of 20 pairs: no delay is measured: delayMechanism?");
}

TEST_F(ToolFailureTest, AnOutputThatIsLostIsToldOnTheStandardError) {
    Words words{"/bin/sh", "-c", "exec \"$@\" >/dev/full", "sh"};
    for (const auto& word : command({"--interface", "eth0", "--seconds", "0"})) {
        words.push_back(word);
    }
    Child child(words);
    EXPECT_EQ(child.wait(), 1);
    EXPECT_EQ(child.errors(), "vantel-host: output: No space left on device\n");
    EXPECT_TRUE(record().empty());
}
