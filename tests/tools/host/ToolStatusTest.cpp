// "vantel-host status" and the socket that it asks.

#include <csignal>
#include <cstring>

#include <sys/stat.h>
#include <unistd.h>

#include "Status/StatusSocket.h"
#include "Status/UnixSocket.h"
#include "Tool.h"
#include "support/Child.h"

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

    const std::string socket = folder.path("status.sock");
};

} // namespace

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
