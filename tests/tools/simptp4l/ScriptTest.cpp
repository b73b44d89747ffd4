#include "Client.h"
#include "Daemon.h"

#include <csignal>
#include <filesystem>
#include <gtest/gtest.h>

#include "support/Processes.h"

namespace {

Finished check(const std::string& script) {
    return run({"--script", script, "--check"});
}

TEST(Simptp4lScript, EveryExampleParses) {
    unsigned count = 0;
    for (const auto& entry : std::filesystem::directory_iterator(SIMPTP4L_EXAMPLES)) {
        const Finished finished = check(entry.path());
        EXPECT_EQ(finished.status, 0) << entry.path() << ": " << finished.errors;
        ++count;
    }
    EXPECT_GE(count, 28U);
}

TEST(Simptp4lScript, EveryExampleRuns) {
    for (const auto& entry : std::filesystem::directory_iterator(SIMPTP4L_EXAMPLES)) {
        const std::string name = entry.path().stem();
        Daemon daemon(readFile(entry.path()), {"eth0", "eth1"});
        const auto isBound = [&] { return std::filesystem::exists(daemon.socketPath()); };
        EXPECT_TRUE(waitUntil([&] { return isBound() || !daemon.process.isRunning(); })) << name;
        if (isBound()) {
            const Client client(daemon.folder.path("me"), daemon.socketPath());
            EXPECT_TRUE(client.send(requests::timeStatus())) << name;
            daemon.process.signal(name == "ignore-sigterm" ? SIGINT : SIGTERM);
        }
        EXPECT_EQ(daemon.process.wait(), name == "exit-at-once" ? 3 : 0) << name;
    }
}

TEST(Simptp4lScript, CommentsAndBlankLinesSayNothing) {
    const Folder folder;
    folder.write("script", "\n# text\n   \n\t# text\noffset 5 # text\nseed 0xFF#\n");
    EXPECT_EQ(check(folder.path("script")).errors,
              "simptp4l: " + folder.path("script") + ":6: bad seed: 0xFF#\n");
}

TEST(Simptp4lScript, EveryErrorIsReportedInOneRun) {
    Daemon daemon("offset\noffset 5\nports -1\n");
    const std::string path = daemon.folder.path("config.sim");
    EXPECT_EQ(daemon.process.wait(), 2);
    EXPECT_EQ(daemon.process.errors(), "simptp4l: " + path + ":2: missing offset\nsimptp4l: " +
                                           path + ":4: bad number of ports: -1\n");
    EXPECT_NE(daemon.log().find(R"({"event":"error","text":")" + path + ":4: bad number of ports"),
              std::string::npos);
    EXPECT_NE(daemon.log().find(R"({"event":"exit","status":2})"), std::string::npos);
}

TEST(Simptp4lScript, AMissingScriptIsAnErrorOnlyWhenItWasNamed) {
    const Folder folder;
    folder.write("config", "[global]\n");
    EXPECT_EQ(check(folder.path("missing")).status, 2);
    EXPECT_EQ(run({"-f", folder.path("config"), "--check"}).status, 0);
}

struct BadLine {
    const char* line;
    const char* text;
};

class Simptp4lBadLine : public testing::TestWithParam<BadLine> {};

TEST_P(Simptp4lBadLine, IsReportedWithItsNumber) {
    const Folder folder;
    folder.write("script", std::string("# first\n\n") + GetParam().line + "\nports 2\n");
    const Finished finished = check(folder.path("script"));
    EXPECT_EQ(finished.status, 2);
    EXPECT_EQ(finished.errors,
              "simptp4l: " + folder.path("script") + ":3: " + GetParam().text + "\n");
}

INSTANTIATE_TEST_SUITE_P(
    Lines, Simptp4lBadLine,
    testing::Values(
        BadLine{"nonsense 1", "unknown word: nonsense"}, BadLine{"offset 1 2", "too much: 2"},
        BadLine{"offset 1.5", "bad offset: 1.5"}, BadLine{"offset 0x", "bad offset: 0x"},
        BadLine{"offset 9223372036854775808", "bad offset: 9223372036854775808"},
        BadLine{"drift-ppb fast", "bad drift: fast"},
        BadLine{"drift-ppb 1e10", "drift beyond 1e9 ppb"}, BadLine{"jitter -1", "bad jitter: -1"},
        BadLine{"sync-interval 0", "interval must not be 0"},
        BadLine{"sync-interval -1", "bad interval: -1"},
        BadLine{"sync-interval nan", "bad interval: nan"},
        BadLine{"clock atomic", "unknown clock: atomic"}, BadLine{"clock fixed", "missing time"},
        BadLine{"clock steered", "missing path"}, BadLine{"clock-offset", "missing offset"},
        BadLine{"clock-offset 1e10", "bad offset: 1e10"},
        BadLine{"gm maybe", "expected present or absent"}, BadLine{"gm-after 1e9", "bad time: 1e9"},
        BadLine{"gm-identity 001B21", "bad identity: 001B21"},
        BadLine{"clock-identity 00112233445566ZZ", "bad identity: 00112233445566ZZ"},
        BadLine{"interface-name 0 eth0", "bad port: 0"},
        BadLine{"interface-name 1", "missing interface name"},
        BadLine{"port-state 1 256", "bad port state: 256"},
        BadLine{"padding some", "expected strict or lenient"},
        BadLine{"follow-up-info", "expected strict or lenient"},
        BadLine{"syncs-before-delay -1", "bad count: -1"}, BadLine{"log", "missing path"},
        BadLine{"ignore SIGKILL", "expected SIGTERM or SIGINT"},
        BadLine{"exit-at-once 256", "bad exit status: 256"},
        BadLine{"set gmPresent 1", "expected DATA_SET.FIELD: gmPresent"},
        BadLine{"set CLOCK.gmPresent 1", "unknown data set: CLOCK"},
        BadLine{"set TIME_STATUS_NP.colour 1", "unknown field: TIME_STATUS_NP.colour"},
        BadLine{"set PORT_DATA_SET.portState 256", "bad value: 256"},
        BadLine{"set PORT_DATA_SET.portState -129", "bad value: -129"},
        BadLine{"set HEADER.sequenceId 1 port x", "bad port: x"},
        BadLine{"on CLOCK do silence", "unknown selector: CLOCK"},
        BadLine{"on any silence",
                "expected do, after [from T] [until T] [after COUNT] [times COUNT]"},
        BadLine{"on any do", "missing action"},
        BadLine{"on any do nothing", "unknown action: nothing"},
        BadLine{"on any do delay -1", "bad time: -1"}, BadLine{"on any do drop 0", "bad index: 0"},
        BadLine{"on any do garbage 65001", "bad length: 65001"},
        BadLine{"on any do flood 10001", "bad count: 10001"},
        BadLine{"on any do gm maybe", "expected on or off"},
        BadLine{"on any do silence now", "too much: now"}, BadLine{"at 1 silence", "expected do"},
        BadLine{"at 1 do silence", "action needs a request: silence"}),
    [](const testing::TestParamInfo<BadLine>& line) { return std::to_string(line.index); });

} // namespace
