// "vantel-host status" and the socket that it asks.

#include <cerrno>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <list>
#include <stdexcept>

#include <sys/stat.h>
#include <unistd.h>

#include "Checks/OrdinaryUser.h"
#include "Status/StatusPage.h"
#include "Status/StatusSocket.h"
#include "Status/UnixSocket.h"
#include "Text.h"
#include "Tool.h"
#include "support/Child.h"
#include "support/Processes.h"
#include "support/SimulatedRun.h"

using testing::HasSubstr;
using testing::StartsWith;
using vantelhost::Json;
using vantelhost::StatusSocket;
using vantelhost::UnixSocket;

namespace {

class ToolStatusTest : public ToolTest {
protected:
    Words host(const Words& options = {}) const {
        Words words = command({"--json", "--interface", "eth0", "--status-socket", socket});
        words.insert(words.end(), options.begin(), options.end());
        return words;
    }

    Result ask(const Words& options = {}) const {
        Words words{HOST_TOOL, "status", "--socket", socket};
        words.insert(words.end(), options.begin(), options.end());
        Child child(words);
        const int status = child.wait();
        return {status, child.output(), child.errors()};
    }

    /// Asks until somebody listens.
    Result askRun(const Words& options = {}) const {
        Result result = ask(options);
        for (int i = 0; i < 1000 && result.status == 2; ++i) {
            result = ask(options);
        }
        return result;
    }

    /// Asks one who says this.
    Result askWhoSays(const std::string& text, const Words& options = {}) const {
        StatusSocket status(socket, [&] { return text; });
        status.attend();
        Words words{HOST_TOOL, "status", "--socket", socket};
        words.insert(words.end(), options.begin(), options.end());
        Child child(words);
        EXPECT_TRUE(waitUntil([&] {
            status.attend();
            return !child.isRunning();
        }));
        const int result = child.wait();
        return {result, child.output(), child.errors()};
    }

    const std::string socket = folder.path("status.sock");
};

/// Whether the process has ended, or waits with a socket open.
bool hasEndedOrWaits(const Child& child) {
    const std::string folder = "/proc/" + std::to_string(child.pid());
    if (!child.isRunning() || contentOf(folder + "/stat").find(") S ") == std::string::npos) {
        return !child.isRunning();
    }
    std::error_code ignored;
    for (std::filesystem::directory_iterator file(folder + "/fd", ignored), end; file != end;
         file.increment(ignored)) {
        if (std::filesystem::read_symlink(*file, ignored).string().rfind("socket:", 0) == 0) {
            return true;
        }
    }
    return false;
}

/// Clients, as many as make who listens there too busy for one more.
std::list<UnixSocket> fillQueueOf(const std::string& path) {
    std::list<UnixSocket> clients;
    while (clients.emplace_back().connectTo(path) == 0) {
    }
    EXPECT_EQ(errno, EAGAIN);
    return clients;
}

} // namespace

TEST_F(ToolStatusTest, AClockThatIsLockedIsStatus0) {
    SimulatedRun run(folder.path(""), "offset 250\n", {"--status-socket", socket});
    ASSERT_TRUE(run.host().waitForOutput("\"state\":\"locked\"")) << run.host().errors();
    const auto result = ask();
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.output, StartsWith("Health          : locked for 0:00:0"));
    EXPECT_THAT(result.output, HasSubstr("\nLast offset     : 250 ns, "));
    EXPECT_EQ(result.errors, "");
    run.host().signal(SIGTERM);
    EXPECT_EQ(run.host().wait(), 0);
}

TEST_F(ToolStatusTest, AClockThatIsNotLockedIsStatus1) {
    Child run(host({"--set", "script=quality pairs metadata"}));
    const auto result = askRun();
    EXPECT_EQ(result.status, 1) << result.errors;
    EXPECT_THAT(result.output, StartsWith("Health          : lost for 0:00:0"));
    EXPECT_THAT(result.output, HasSubstr("\nPort1           : PTP_SLAVE on eth0\n"));
    EXPECT_THAT(result.output, HasSubstr("Fake time referen\n"));
    EXPECT_EQ(result.errors, "");
    run.signal(SIGTERM);
    EXPECT_EQ(run.wait(), 0);
    EXPECT_NE(::access(socket.c_str(), F_OK), 0) << "the socket is left";
}

TEST_F(ToolStatusTest, AsJsonItIsOneObject) {
    Child run(host({"--set", "script=quality pairs"}));
    const Json status = Json::parse(askRun({"--json"}).output);
    EXPECT_EQ(status["health"], "lost");
    EXPECT_EQ(status["pairs"], 3);
    run.signal(SIGTERM);
    run.wait();
}

TEST_F(ToolStatusTest, WhereNobodyRunsItIsStatus2) {
    const auto result = ask();
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.errors, "vantel-host: " + socket +
                                 ": No such file or directory; no run listens there: vantel-host "
                                 "run --status-socket\n");
}

TEST_F(ToolStatusTest, AnAnswerThatIsNotThatOfARunIsStatus1) {
    const std::string complaint = "vantel-host: " + socket +
                                  ": the answer is not understood: it is not that of a run of "
                                  "this version\n";
    for (const std::string text : {"{}", "[\"health\"]", "{\"health\": \"locked\"}",
                                   "{\"health\": 1, \"since\": {}}", "220 ready\r\n"}) {
        const auto result = askWhoSays(text);
        EXPECT_EQ(result.status, 1) << text;
        EXPECT_EQ(result.output, "") << text;
        EXPECT_EQ(result.errors, complaint) << text;
    }
    const auto result = askWhoSays("{}", {"--json"});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.output + result.errors, complaint);
}

TEST_F(ToolStatusTest, NoAnswerIsStatus1) {
    const auto result = askWhoSays("");
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.errors, "vantel-host: " + socket + ": the run there does not answer\n");
}

TEST_F(ToolStatusTest, ABusyRunIsWaitedFor) {
    const vantelhost::StatusPage page;
    StatusSocket status(socket, [&] { return vantelhost::toAscii(page.at(0)); });
    status.attend();
    const auto clients = fillQueueOf(socket);
    Child child({HOST_TOOL, "status", "--socket", socket});
    EXPECT_TRUE(waitUntil([&] { return hasEndedOrWaits(child); }));
    EXPECT_TRUE(waitUntil([&] {
        status.attend();
        return !child.isRunning();
    }));
    EXPECT_EQ(child.wait(), 1) << child.errors();
    EXPECT_THAT(child.output(), StartsWith("Health          : starting for "));
}

TEST_F(ToolStatusTest, ABusyRunIsGivenUpWhenPatienceIsOver) {
    StatusSocket status(socket, [] { return ""; });
    status.attend();
    const auto clients = fillQueueOf(socket);
    const auto start = std::chrono::steady_clock::now();
    EXPECT_NE(UnixSocket(std::chrono::seconds(1)).connectTo(socket), 0);
    EXPECT_EQ(errno, EAGAIN);
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(900));
}

TEST_F(ToolStatusTest, APathThatIsTooLongIsRefused) {
    const Words options{"--interface", "eth0", "--status-socket", std::string(200, 'x')};
    const auto result = run(options);
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("the path of the socket is too long"));
    EXPECT_TRUE(record().empty());
}

TEST_F(ToolStatusTest, TheSocketIsOfItsUserAndGroupAlone) {
    Child run(host());
    EXPECT_EQ(askRun().status, 1);
    struct stat state {};
    ASSERT_EQ(::stat(socket.c_str(), &state), 0);
    EXPECT_EQ(state.st_mode & 0777U, 0660U);
    run.signal(SIGTERM);
    run.wait();
}

TEST_F(ToolStatusTest, WhatAKilledRunLeftIsTakenOver) {
    {
        Child killed(host());
        EXPECT_EQ(askRun().status, 1);
        killed.signal(SIGKILL);
        killed.wait();
    }
    ASSERT_EQ(::access(socket.c_str(), F_OK), 0);
    EXPECT_EQ(ask().status, 2);
    Child run(host());
    EXPECT_EQ(askRun().status, 1);
    run.signal(SIGTERM);
    run.wait();
}

TEST_F(ToolStatusTest, ASocketThatCannotBeMadeIsToldAndTheRunGoesOn) {
    Child run(command(
        {"--json", "--interface", "eth0", "--status-socket", folder.path("no/such/folder")}));
    ASSERT_TRUE(run.waitForOutput("\"event\":\"status-socket\""));
    run.signal(SIGTERM);
    EXPECT_EQ(run.wait(), 0);
    const Result result{0, run.output(), ""};
    EXPECT_EQ(result.events("status-socket").at(0)["problem"], "No such file or directory");
}

TEST_F(ToolStatusTest, TheSocketOfAnotherRunIsLeftAlone) {
    const StatusSocket::Clock::time_point now{};
    StatusSocket first(socket, [] { return "first"; });
    EXPECT_FALSE(first.attend(now));
    StatusSocket second(socket, [] { return "second"; });
    const auto news = second.attend(now);
    ASSERT_TRUE(news);
    EXPECT_EQ(news->members["problem"], "another run listens there");
    EXPECT_FALSE(second.attend(now + std::chrono::seconds(10))) << "told again";
}

TEST_F(ToolStatusTest, TheSocketOfARunThatIsBusyIsLeftAlone) {
    StatusSocket first(socket, [] { return "first"; });
    EXPECT_FALSE(first.attend());
    const auto clients = fillQueueOf(socket);
    StatusSocket second(socket, [] { return "second"; });
    const auto news = second.attend();
    ASSERT_TRUE(news);
    EXPECT_EQ(news->members["problem"], "another run listens there");
    EXPECT_EQ(::access(socket.c_str(), F_OK), 0);
}

TEST_F(ToolStatusTest, ASocketThatMayNotBeAskedIsLeftAlone) {
    StatusSocket first(socket, [] { return "first"; });
    EXPECT_FALSE(first.attend());
    ::chmod(socket.c_str(), 0);
    ::chmod(folder.path("").c_str(), 0777);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    StatusSocket second(socket, [] { return "second"; });
    const auto news = second.attend();
    ASSERT_TRUE(news);
    EXPECT_EQ(news->members["problem"], "Permission denied");
    EXPECT_EQ(::access(socket.c_str(), F_OK), 0);
}

TEST_F(ToolStatusTest, ASocketThatReplacedItsOwnIsLeftAtTheEnd) {
    StatusSocket second(socket, [] { return "second"; });
    {
        StatusSocket first(socket, [] { return "first"; });
        EXPECT_FALSE(first.attend());
        ::unlink(socket.c_str());
        EXPECT_FALSE(second.attend());
    }
    EXPECT_EQ(UnixSocket().connectTo(socket), 0);
}

TEST_F(ToolStatusTest, AClientIsLetGoWhenThereIsNoAnswer) {
    StatusSocket status(socket, []() -> std::string { throw std::runtime_error("no answer"); });
    EXPECT_FALSE(status.attend());
    const UnixSocket client;
    ASSERT_EQ(client.connectTo(socket), 0);
    EXPECT_THROW(status.attend(), std::runtime_error);
    char octet = 0;
    EXPECT_EQ(::read(client.descriptor(), &octet, 1), 0);
}

TEST_F(ToolStatusTest, AFileThatIsNoSocketIsLeftAlone) {
    writeFile(socket, "precious");
    StatusSocket status(socket, [] { return ""; });
    const auto news = status.attend();
    ASSERT_TRUE(news);
    EXPECT_EQ(news->members["problem"], "Address already in use");
    EXPECT_EQ(contentOf(socket), "precious");
}

TEST_F(ToolStatusTest, ASocketIsTriedAgainAfter10Seconds) {
    const StatusSocket::Clock::time_point now{};
    StatusSocket status(folder.path("later/s"), [] { return "text"; });
    EXPECT_TRUE(status.attend(now));
    ASSERT_EQ(::mkdir(folder.path("later").c_str(), 0700), 0);
    EXPECT_FALSE(status.attend(now + std::chrono::seconds(9)));
    EXPECT_NE(UnixSocket().connectTo(folder.path("later/s")), 0);
    EXPECT_FALSE(status.attend(now + std::chrono::seconds(10)));
    EXPECT_EQ(UnixSocket().connectTo(folder.path("later/s")), 0);
    ::unlink(folder.path("later/s").c_str());
    ::rmdir(folder.path("later").c_str());
}

TEST_F(ToolStatusTest, AClientThatNeverReadsHoldsNothingUp) {
    const std::string large(10 << 20U, 'x');
    StatusSocket status(socket, [&] { return large; });
    status.attend();
    const UnixSocket client;
    ASSERT_EQ(client.connectTo(socket), 0);
    EXPECT_FALSE(status.attend());
    char octet = 0;
    EXPECT_EQ(::read(client.descriptor(), &octet, 1), 1);
}
