#include "Client.h"
#include "Daemon.h"

#include <csignal>
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <unistd.h>

#include "support/Processes.h"

namespace {

bool contains(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

TEST(Simptp4lProcess, EndsOnSigtermAndSigintAndRemovesTheSocket) {
    for (int number : {SIGTERM, SIGINT}) {
        Daemon daemon;
        ASSERT_TRUE(daemon.waitUntilBound());
        EXPECT_TRUE(std::filesystem::is_socket(daemon.socketPath()));
        daemon.process.signal(number);
        EXPECT_EQ(daemon.process.wait(), 0);
        EXPECT_FALSE(std::filesystem::exists(daemon.socketPath()));
        EXPECT_TRUE(contains(daemon.log(), number == SIGTERM ? "SIGTERM" : "SIGINT"));
        EXPECT_TRUE(contains(daemon.log(), R"({"event":"exit","status":0})"));
    }
}

TEST(Simptp4lProcess, IgnoresASignalAsTold) {
    Daemon daemon("ignore SIGTERM\n");
    ASSERT_TRUE(daemon.waitUntilBound());
    daemon.process.signal(SIGTERM);
    ASSERT_TRUE(waitUntil([&] { return contains(daemon.log(), "\"ignored\":true"); }));
    EXPECT_TRUE(daemon.process.isRunning());
    daemon.process.signal(SIGKILL);
    EXPECT_EQ(daemon.process.wait(), 1000 + SIGKILL);
}

TEST(Simptp4lProcess, ReplacesAStaleSocketFile) {
    Daemon first;
    ASSERT_TRUE(first.waitUntilBound());
    first.process.signal(SIGKILL);
    first.process.wait();
    ASSERT_TRUE(std::filesystem::exists(first.socketPath()));
    const Child second({SIMPTP4L_PATH, "-f", first.folder.path("config")});
    const Client client(first.folder.path("me"), first.socketPath());
    EXPECT_TRUE(waitUntil([&] { return client.send(requests::timeStatus()); }));
    EXPECT_EQ(client.receive().size(), 2 * 104U);
}

TEST(Simptp4lProcess, RecordsHowItWasStarted) {
    const int inherited = open("/dev/null", O_RDONLY);
    ASSERT_GE(fcntl(inherited, F_DUPFD, 77), 77);
    sigset_t blocked;
    sigset_t before;
    sigemptyset(&blocked);
    sigaddset(&blocked, SIGUSR1);
    sigprocmask(SIG_BLOCK, &blocked, &before);
    const auto handler = std::signal(SIGUSR2, SIG_IGN);
    const Daemon daemon({}, {"v0", "v1x"});
    std::signal(SIGUSR2, handler);
    sigprocmask(SIG_SETMASK, &before, nullptr);
    close(77);
    close(inherited);
    ASSERT_TRUE(daemon.waitUntilBound());
    const std::string start = daemon.log().substr(0, daemon.log().find('\n'));
    EXPECT_TRUE(contains(start, R"({"event":"start","argv":[")" SIMPTP4L_PATH R"(","-f",")" +
                                    daemon.folder.path("config") + R"(","-i","v0","-i","v1x"])"));
    EXPECT_TRUE(
        contains(start, R"("environment":[],"pid":)" + std::to_string(daemon.process.pid())));
    EXPECT_TRUE(contains(start, R"("openDescriptors":[0,1,2,)"));
    EXPECT_TRUE(contains(start, ",77"));
    EXPECT_TRUE(contains(start, R"("blockedSignals":["SIGUSR1"])"));
    EXPECT_TRUE(contains(start, R"("SIGUSR2")"));
}

TEST(Simptp4lProcess, LogsRequestsAndAnswers) {
    const Daemon daemon;
    ASSERT_TRUE(daemon.waitUntilBound());
    const Client client(daemon.folder.path("me"), daemon.socketPath());
    const std::string answer = client.ask(requests::timeStatus());
    ASSERT_TRUE(waitUntil([&] { return contains(daemon.log(), answer); }));
    EXPECT_TRUE(contains(daemon.log(), "\"octets\":\"" + requests::timeStatus() + "\",\"from\":\"" +
                                           daemon.folder.path("me") + "\""));
}

TEST(Simptp4lProcess, ExitsAtOnceAsTold) {
    Daemon daemon("exit-at-once 3\n");
    EXPECT_EQ(daemon.process.wait(), 3);
    EXPECT_TRUE(contains(daemon.log(), R"("event":"start")"));
    EXPECT_FALSE(daemon.isBound());
}

TEST(Simptp4lProcess, BindsLateAsTold) {
    Daemon daemon("start-delay 0.2\n");
    ASSERT_TRUE(daemon.waitUntilBound());
    const std::string log = daemon.log();
    const std::string mark = R"({"event":"bound","t":)";
    EXPECT_GE(std::stod(log.substr(log.find(mark) + mark.size())), 0.2);
}

TEST(Simptp4lProcess, EndsOnASignalBeforeItIsBound) {
    Daemon daemon("start-delay 1000\n");
    ASSERT_TRUE(waitUntil([&] { return contains(daemon.log(), R"("event":"start")"); }));
    // The signal may come before the handler: then it ends the process by itself.
    daemon.process.signal(SIGTERM);
    const int status = daemon.process.wait();
    EXPECT_TRUE(status == 0 || status == 1000 + SIGTERM) << status;
}

TEST(Simptp4lProcess, AcceptsOtherOptionsOfPtp4l) {
    const Folder folder;
    folder.write("config", "[global]\n");
    const Finished finished =
        run({"-A", "-2Smq", "-s", "-l", "7", "-p/dev/ptp0", "-ieth0", "-f", folder.path("config"),
             "--summary_interval=3", "--clock_servo", "pi", "--check"});
    EXPECT_EQ(finished.status, 0) << finished.errors;
}

TEST(Simptp4lProcess, RefusesWhatItCannotRead) {
    const Folder folder;
    folder.write("bad", "[global]\n# comment\npriority1 900\n[eth0]\npriority2 x\n");
    EXPECT_EQ(run({"-Z"}).status, 1);
    EXPECT_EQ(run({"-f"}).status, 1);
    EXPECT_EQ(run({"-f", folder.path("missing")}).status, 1);
    const Finished finished = run({"-f", folder.path("bad")});
    EXPECT_EQ(finished.status, 1);
    EXPECT_EQ(finished.errors, "simptp4l: " + folder.path("bad") + ":3: bad value for priority1\n");
}

TEST(Simptp4lProcess, ReportsASocketThatCannotBeBound) {
    Daemon daemon({}, {}, "uds_address /nonexistent/folder/ptp4l\n");
    EXPECT_EQ(daemon.process.wait(), 1);
    EXPECT_TRUE(contains(daemon.process.errors(), "/nonexistent/folder/ptp4l: cannot bind"));
    EXPECT_TRUE(contains(daemon.log(), R"({"event":"exit","status":1})"));
}

TEST(Simptp4lProcess, ShowsHelp) {
    const Finished finished = run({"--help"});
    EXPECT_EQ(finished.status, 0);
    EXPECT_TRUE(contains(finished.output, "--script FILE"));
}

} // namespace
