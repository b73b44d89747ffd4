// Sessions that fail: what --restart makes of them, and what systemd hears.

#include <algorithm>
#include <array>
#include <csignal>
#include <cstring>

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include "Tool.h"
#include "support/Child.h"

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;
using vantelhost::Json;

namespace {

/// In the place of systemd's notification socket.
class NotifySocket {
public:
    explicit NotifySocket(const std::string& path)
        : descriptor_(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0)) {
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        std::strncpy(address.sun_path, path.c_str(), sizeof(address.sun_path) - 1);
        EXPECT_EQ(::bind(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address)),
                  0);
    }
    ~NotifySocket() { ::close(descriptor_); }
    NotifySocket(const NotifySocket&) = delete;
    NotifySocket& operator=(const NotifySocket&) = delete;

    /// Whether a message that begins so comes, and none is longer away than the patience, in ms.
    bool waitFor(const std::string& begin, int patience = 10000) {
        pollfd input{descriptor_, POLLIN, 0};
        while (::poll(&input, 1, patience) == 1) {
            std::array<char, 1000> buffer{};
            const auto size = ::recv(descriptor_, buffer.data(), buffer.size(), 0);
            const std::string message(buffer.data(),
                                      static_cast<std::size_t>(std::max<ssize_t>(size, 0)));
            if (message.rfind(begin, 0) == 0) {
                return true;
            }
        }
        return false;
    }

private:
    int descriptor_;
};

class ToolRestartTest : public ToolTest {
protected:
    /// A run whose plug-in starts a command of the shell.
    Words withChild(const std::string& shell, const Words& options) const {
        Words words = command({"--json", "--interface", "eth0", "--set", "child=" + shell});
        words.insert(words.end(), options.begin(), options.end());
        return words;
    }

    static Result end(Child& child) {
        child.signal(SIGTERM);
        const int status = child.wait();
        return {status, child.output(), child.errors()};
    }
};

std::vector<std::string> namesIn(const Result& result) {
    std::vector<std::string> names;
    for (const auto& event : result.events()) {
        names.push_back(event["event"]);
    }
    return names;
}

} // namespace

TEST_F(ToolRestartTest, WithoutItADeadDaemonEndsTheRun) {
    Child child(withChild("exit 3", {}));
    EXPECT_EQ(child.wait(), 1);
    const Result result{1, child.output(), child.errors()};
    EXPECT_THAT(result.events("stopping").at(0)["cause"].get<std::string>(),
                HasSubstr("ended with status 3"));
    EXPECT_THAT(result.events("cause").at(0)["text"].get<std::string>(),
                HasSubstr("ended with status 3"));
    EXPECT_EQ(result.events("health").at(0)["state"], "dead");
    EXPECT_THAT(record(),
                ElementsAre(StartsWith("initialise"), "blocked yes", "start", "stop", "finalise"));
}

TEST_F(ToolRestartTest, ADeadDaemonGetsANewSessionInTheSameRun) {
    // Ends the first time only.
    const std::string mark = folder.path("mark");
    Child child(withChild("test -e " + mark + " && exec sleep 1000; touch " + mark + "; exit 3",
                          {"--restart"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"started\"", 2));
    const auto result = end(child);
    EXPECT_EQ(result.status, 0) << result.output;
    EXPECT_THAT(namesIn(result),
                ElementsAre("loaded", "initialised", "started", "daemon-ended", "health",
                            "stopping", "stopped", "restart", "initialised", "health", "started",
                            "stopping", "health", "stopped", "summary"));
    EXPECT_EQ(result.events("stopping").at(0)["cause"], "restart");
    EXPECT_EQ(result.events("stopping").at(1)["cause"], "SIGTERM");
    const Json restart = result.events("restart").at(0);
    EXPECT_THAT(restart["cause"].get<std::string>(), HasSubstr("ended with status 3"));
    EXPECT_EQ(restart["delay"], 1.0);
    EXPECT_EQ(restart["restarts"], 1);
    EXPECT_EQ(result.events("health").at(1)["before"], "dead");
    EXPECT_GE(result.events("health").at(1)["spent"].get<double>(), 1.0);
    EXPECT_THAT(record(),
                ElementsAre(StartsWith("initialise"), "blocked yes", "start", "stop", "finalise",
                            StartsWith("initialise"), "blocked yes", "start", "stop", "finalise"));
}

TEST_F(ToolRestartTest, ASignalEndsTheWaitForTheNextSession) {
    Child child(withChild("exit 3", {"--restart"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"restart\"", 2));
    const auto result = end(child);
    EXPECT_EQ(result.status, 0); // it is the end that was asked for
    EXPECT_EQ(result.events("restart").at(1)["delay"], 2.0);
    EXPECT_EQ(result.events("health").back()["state"], "stopping");
    EXPECT_EQ(result.events("stopping").back()["cause"], "SIGTERM");
    EXPECT_THAT(result.events("cause").at(0)["text"].get<std::string>(),
                HasSubstr("ended with status 3"));
}

TEST_F(ToolRestartTest, TheEndOfTheTimeTellsOfTheLastSession) {
    Child child(withChild("exit 3", {"--restart", "--seconds", "0.5"}));
    EXPECT_EQ(child.wait(), 1);
}

TEST_F(ToolRestartTest, ADaemonThatNobodyWaitsForLeavesNoZombie) {
    const std::string pid = folder.path("pid");
    Child child(
        withChild("echo $$ >" + pid + "; exec sleep 1000",
                  {"--restart", "--give-up-after", "0.1", "--set", "script=quality leaves-child"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"restart\""));
    EXPECT_EQ(::kill(std::stoi(contentOf(pid)), 0), -1);
    end(child);
}

TEST_F(ToolRestartTest, AStartThatFailsIsTriedAgain) {
    Child child(withChild("", {"--restart", "--set", "script=start-fails"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"restart\""));
    const auto result = end(child);
    EXPECT_EQ(result.events("restart").at(0)["cause"], "start failed");
    EXPECT_EQ(result.events("error").at(0)["code"], -52010);
}

TEST_F(ToolRestartTest, AnInitialisationThatFailsAtFirstEndsTheRun) {
    const auto result = play("initialise-fails", {"--restart"});
    EXPECT_EQ(result.status, 1);
    EXPECT_TRUE(result.events("restart").empty());
}

TEST_F(ToolRestartTest, ALostSessionIsGivenUp) {
    Child child(withChild("", {"--restart", "--give-up-after", "0.5", "--set", "script=quality"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"restart\""));
    const auto result = end(child);
    EXPECT_THAT(result.events("restart").at(0)["cause"].get<std::string>(),
                testing::MatchesRegex("lost for [0-9]+ s: odd"));
    EXPECT_EQ(result.events("health").at(0)["state"], "lost");
}

TEST_F(ToolRestartTest, WithAPatienceOf0ALostSessionIsKept) {
    const auto result = play("quality", {"--restart", "--give-up-after", "0", "--seconds", "1.2"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("health").at(0)["state"], "lost");
    EXPECT_TRUE(result.events("restart").empty());
}

TEST_F(ToolRestartTest, TheEpochOffsetInUseIsGivenToEverySession) {
    const std::string fifo = folder.path("fifo");
    Child child(withChild("sleep 0.5; exit 3",
                          {"--restart", "--fifo", fifo, "--create-fifo", "--set", "fifo=" + fifo,
                           "--epoch-offset", "1", "--epoch-offset-at", "0.1:2"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"started\"", 2));
    const auto result = end(child);
    std::vector<int> offsets;
    for (const auto& event : result.events("epoch-offset")) {
        offsets.push_back(event["offset"]);
    }
    EXPECT_THAT(offsets, ElementsAre(1, 2, 2));
    EXPECT_THAT(record(), Contains("fifo 2 0 0 0 0 0 0 0"));
}

TEST_F(ToolRestartTest, ABadPatienceIsRefused) {
    const auto result = run({"--interface", "eth0", "--give-up-after", "-1"});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("--give-up-after"));
}

TEST_F(ToolRestartTest, SystemdHearsHowItStands) {
    const std::string path = folder.path("notify");
    NotifySocket systemd(path);
    Words words{"/usr/bin/env", "NOTIFY_SOCKET=" + path};
    for (const auto& word : withChild("exec sleep 1000", {"--set", "script=quality"})) {
        words.push_back(word);
    }
    Child child(words);
    EXPECT_TRUE(systemd.waitFor("READY=1"));
    EXPECT_TRUE(systemd.waitFor("STATUS=lost: odd"));
    EXPECT_TRUE(systemd.waitFor("WATCHDOG=1"));
    child.signal(SIGTERM);
    EXPECT_TRUE(systemd.waitFor("STOPPING=1"));
    EXPECT_EQ(child.wait(), 0);
}

TEST_F(ToolRestartTest, TheWatchdogGoesHungryWhenThePlugInFallsSilent) {
    const std::string path = folder.path("notify");
    NotifySocket systemd(path);
    Words words{"/usr/bin/env", "NOTIFY_SOCKET=" + path};
    for (const auto& word : withChild("exec sleep 1000", {"--set", "script=quality"})) {
        words.push_back(word);
    }
    Child child(words);
    ASSERT_TRUE(systemd.waitFor("WATCHDOG=1"));
    // It never calls again: after 10 s nothing comes.
    int meals = 0;
    while (systemd.waitFor("WATCHDOG=1", 1000)) {
        ASSERT_LT(++meals, 100);
    }
    EXPECT_GT(meals, 4);
    end(child);
}
