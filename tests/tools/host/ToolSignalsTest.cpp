// How a run is ended from outside.

#include <csignal>

#include "Tool.h"
#include "support/Child.h"

using testing::Contains;
using testing::HasSubstr;
using testing::StartsWith;

namespace {

constexpr char sessionStarted[] = "\"event\":\"started\"";

} // namespace

TEST_F(ToolTest, EachStopSignalStopsTheRunCleanly) {
    struct Row {
        int number;
        const char* name;
    };
    for (const auto& row : {Row{SIGTERM, "SIGTERM"}, Row{SIGINT, "SIGINT"}, Row{SIGHUP, "SIGHUP"},
                            Row{SIGQUIT, "SIGQUIT"}}) {
        Child child(command({"--json", "--interface", "eth0"}));
        ASSERT_TRUE(child.waitForOutput(sessionStarted));
        child.signal(row.number);
        const int status = child.wait();
        EXPECT_EQ(status, 0);
        const Result result{status, child.output(), child.errors()};
        EXPECT_EQ(result.events("stopping").at(0)["cause"], row.name);
        EXPECT_EQ(result.events("summary").size(), 1U);
        EXPECT_EQ(record().back(), "finalise");
    }
}

TEST_F(ToolTest, ASignalEndsARunWithADurationEarly) {
    Child child(command({"--json", "--interface", "eth0", "--seconds", "1000"}));
    ASSERT_TRUE(child.waitForOutput(sessionStarted));
    child.signal(SIGTERM);
    EXPECT_EQ(child.wait(), 0);
}

TEST_F(ToolTest, SignalsAreBlockedWhenThePlugInIsLoaded) {
    ASSERT_EQ(play("").status, 0);
    EXPECT_THAT(record(), Contains("blocked yes"));
}

TEST_F(ToolTest, AStoppedAndContinuedHostGoesOn) {
    Child child(command({"--json", "--interface", "eth0"}));
    ASSERT_TRUE(child.waitForOutput(sessionStarted));
    child.signal(SIGSTOP);
    child.signal(SIGCONT);
    child.signal(SIGTERM);
    EXPECT_EQ(child.wait(), 0);
    EXPECT_THAT(child.output(), HasSubstr("\"cause\":\"SIGTERM\""));
}

TEST_F(ToolTest, AReaderThatGoesAwayStopsTheRunInGoodOrder) {
    Child child(command({"--json", "--interface", "eth0", "--create-fifo", "--fifo",
                         folder.path("epoch"), "--epoch-offset-at", "0.5:1"}));
    ASSERT_TRUE(child.waitForOutput(sessionStarted));
    child.closeOutput();
    EXPECT_EQ(child.wait(), 1);
    EXPECT_EQ(record().back(), "finalise");
}
