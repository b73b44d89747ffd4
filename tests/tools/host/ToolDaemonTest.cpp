// The host with the plug-in itself, and the simulated ptp4l.

#include <csignal>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "Terminal.h"
#include "Tool.h"
#include "support/Child.h"

using testing::HasSubstr;
using testing::Not;
using vantelhost::Json;

namespace {

constexpr char died[] = "PTP sub process has died unexpectedly";

/// The plug-in of the tests has its paths below the working folder.
class ToolDaemonTest : public testing::Test {
protected:
    void SetUp() override {
        ASSERT_EQ(::symlink(VANTEL_SIMPTP4L, folder.path("ptp4l").c_str()), 0);
        writeFile(folder.path("ptp4l.conf.sim"), "offset 250\n");
    }

    Words run(const Words& options, const std::string& record = "record") const {
        Words words{"/bin/sh",
                    "-c",
                    "cd \"$0\" && exec \"$@\"",
                    folder.path(""),
                    HOST_TOOL,
                    "run",
                    "--library",
                    VANTEL_BC_TEST_LIBRARY,
                    "--interface",
                    "sim0",
                    "--fifo",
                    folder.path("quillEpochOffset"),
                    "--create-fifo",
                    "--set",
                    "logSyncInterval=-3",
                    "--set",
                    "udsAddress=" + folder.path("uds"),
                    "--set",
                    "configFile=" + folder.path("ptp4l.conf"),
                    "--record",
                    folder.path(record)};
        words.insert(words.end(), options.begin(), options.end());
        return words;
    }

    Result recorded() const { return {0, contentOf(folder.path("record")), ""}; }

    Folder folder;
};

} // namespace

TEST_F(ToolDaemonTest, CtrlCIsACleanEndThoughTheDaemonHearsItToo) {
    for (const auto& options : {Words{}, Words{"--plain"}}) {
        Terminal terminal(run(options));
        ASSERT_TRUE(terminal.waitForOutput("Port1"));
        terminal.write("\x03");
        EXPECT_EQ(terminal.wait(), 0);
        EXPECT_THAT(terminal.output(), Not(HasSubstr(died)));
        EXPECT_THAT(terminal.output(), HasSubstr(" 0 errors, offset "));
        const Json metadata = recorded().events("metadata").back()["metadata"];
        EXPECT_TRUE(metadata.contains("Port1")) << metadata;
        // It did hear it, and the record has what the plug-in said of that.
        EXPECT_EQ(recorded().events("expected").back()["reason"], died);
    }
}

TEST_F(ToolDaemonTest, ADaemonThatIsNotThereIsTold) {
    ASSERT_EQ(::unlink(folder.path("ptp4l").c_str()), 0);
    Child host(run({"--json"}));
    ASSERT_TRUE(host.waitForOutput("\"event\":\"daemon-ended\""));
    host.signal(SIGTERM);
    EXPECT_EQ(host.wait(), 1);
    EXPECT_THAT(recorded().events("cause").at(0)["text"].get<std::string>(),
                HasSubstr("ended with status 255, without a word"));
}

TEST_F(ToolDaemonTest, ASecondInstanceIsRefusedAndTheFirstGoesOn) {
    Child first(run({"--json"}));
    ASSERT_TRUE(first.waitForOutput("\"offset\":250"));
    Child second(run({}, "second"));
    EXPECT_EQ(second.wait(), 2);
    EXPECT_THAT(second.errors(), HasSubstr("in use by "));
    EXPECT_THAT(second.errors(), HasSubstr(", started by "));
    first.signal(SIGTERM);
    EXPECT_EQ(first.wait(), 0);
}

TEST_F(ToolDaemonTest, ADaemonThatIsKilledIsReplacedAndTheClockLocksAgain) {
    const std::string socket = folder.path("status");
    Child host(run({"--json", "--restart", "--status-socket", socket}));
    ASSERT_TRUE(host.waitForOutput("\"state\":\"locked\""));
    Child locked({HOST_TOOL, "status", "--socket", socket});
    EXPECT_EQ(locked.wait(), 0);
    EXPECT_THAT(locked.output(), HasSubstr("Health          : locked for 0:00:"));

    Child killer({"/bin/sh", "-c", "exec pkill -9 -P $0", std::to_string(host.pid())});
    ASSERT_EQ(killer.wait(), 0);
    ASSERT_TRUE(host.waitForOutput("\"state\":\"locked\"", 2));
    Child again({HOST_TOOL, "status", "--socket", socket, "--json"});
    EXPECT_EQ(again.wait(), 0);
    EXPECT_EQ(Json::parse(again.output())["restarts"], 1);
    host.signal(SIGTERM);
    EXPECT_EQ(host.wait(), 0);
    std::vector<std::string> states;
    for (const auto& event : recorded().events("health")) {
        states.push_back(event["state"]);
    }
    EXPECT_THAT(states, testing::IsSupersetOf({"locked", "dead", "starting", "stopping"}));
}
