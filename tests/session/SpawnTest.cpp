#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <filesystem>

#include <fcntl.h>
#include <gmock/gmock.h>

#include "Interposed.h"
#include "SessionFixture.h"

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;
using SpawnTest = SessionTest;

/// All signals blocked in this thread, and these ignored, while this object lives.
class DeafHost {
public:
    DeafHost() {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &mask_);
        struct sigaction ignore {};
        ignore.sa_handler = SIG_IGN;
        sigaction(SIGTERM, &ignore, &termination_);
        sigaction(SIGCHLD, &ignore, &child_);
    }
    ~DeafHost() {
        sigaction(SIGTERM, &termination_, nullptr);
        sigaction(SIGCHLD, &child_, nullptr);
        pthread_sigmask(SIG_SETMASK, &mask_, nullptr);
    }
    DeafHost(const DeafHost&) = delete;
    DeafHost& operator=(const DeafHost&) = delete;

private:
    sigset_t mask_{};
    struct sigaction termination_ {};
    struct sigaction child_ {};
};

/// The descriptors that a child of this process inherits.
std::vector<int> inheritedDescriptors() {
    std::vector<int> descriptors;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
        const int descriptor = std::stoi(entry.path().filename());
        const int flags = fcntl(descriptor, F_GETFD);
        if (flags >= 0 && (flags & FD_CLOEXEC) == 0) {
            descriptors.push_back(descriptor);
        }
    }
    std::sort(descriptors.begin(), descriptors.end());
    return descriptors;
}

TEST_F(SpawnTest, ArgumentsWithoutInterfaces) {
    begin("gm absent\n", "[]");
    ASSERT_TRUE(SimulatedDaemon::waitFor("start"));
    EXPECT_THAT(SimulatedDaemon::events("start").at(0).argv,
                ElementsAre("./ptp4l", "-f", "ptp4l.conf"));
}

TEST_F(SpawnTest, ArgumentsNameTheInterfacesInTheirOrder) {
    begin("gm absent\n", R"(["eth1","eth0","with blank",""])");
    ASSERT_TRUE(SimulatedDaemon::waitFor("start"));
    EXPECT_THAT(SimulatedDaemon::events("start").at(0).argv,
                ElementsAre("./ptp4l", "-f", "ptp4l.conf", "-i", "eth1", "-i", "eth0", "-i",
                            "with blank", "-i", ""));
}

TEST_F(SpawnTest, ManyInterfacesAllArrive) {
    std::string interfaces = R"(["eth0")";
    for (int number = 1; number < 200; ++number) {
        interfaces += ",\"eth" + std::to_string(number) + '"';
    }
    begin("ports 0\n", interfaces + "]");
    ASSERT_TRUE(SimulatedDaemon::waitFor("start"));
    const auto argv = SimulatedDaemon::events("start").at(0).argv;
    ASSERT_EQ(argv.size(), 403U);
    EXPECT_EQ(argv[401], "-i");
    EXPECT_EQ(argv[402], "eth199");
}

TEST_F(SpawnTest, EnvironmentIsEmpty) {
    setenv("VANTEL_TEST_VARIABLE", "1", 1);
    begin("gm absent\n");
    ASSERT_TRUE(SimulatedDaemon::waitFor("start"));
    EXPECT_THAT(SimulatedDaemon::events("start").at(0).environment, IsEmpty());
    unsetenv("VANTEL_TEST_VARIABLE");
}

TEST_F(SpawnTest, DaemonHearsSignalsThatTheHostDoesNot) {
    const DeafHost deaf;
    begin("gm absent\n");
    ASSERT_TRUE(SimulatedDaemon::waitFor("bound"));
    const auto start = SimulatedDaemon::events("start").at(0);
    EXPECT_THAT(start.blockedSignals, IsEmpty());
    EXPECT_THAT(start.ignoredSignals, Not(Contains("SIGTERM")));
    EXPECT_THAT(start.ignoredSignals, Not(Contains("SIGCHLD")));
    session.stop();
    ASSERT_EQ(SimulatedDaemon::events("signal").size(), 1U);
    EXPECT_EQ(SimulatedDaemon::events("signal").at(0).signal, "SIGTERM");
    EXPECT_FALSE(hasChildren());
    EXPECT_THAT(sentSignals(), ElementsAre(SentSignal{start.pid, SIGTERM}));
}

TEST_F(SpawnTest, SignalMaskOfTheHostStaysAsItIs) {
    const DeafHost deaf;
    sigset_t before;
    pthread_sigmask(SIG_SETMASK, nullptr, &before);
    sigdelset(&before, SIGUSR1);
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
    begin("gm absent\n");
    sigset_t after;
    pthread_sigmask(SIG_SETMASK, nullptr, &after);
    for (int number = 1; number < SIGRTMIN; ++number) {
        EXPECT_EQ(sigismember(&before, number), sigismember(&after, number)) << number;
    }
    struct sigaction termination {};
    sigaction(SIGTERM, nullptr, &termination);
    EXPECT_EQ(termination.sa_handler, SIG_IGN);
}

TEST_F(SpawnTest, DaemonInheritsNoDescriptorOfAnEarlierSession) {
    const auto expected = inheritedDescriptors();
    begin("gm present\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_EQ(inheritedDescriptors(), expected);
    Session later;
    later.initialise();
    later.start();
    ASSERT_TRUE(SimulatedDaemon::waitFor("start", 2));
    EXPECT_EQ(SimulatedDaemon::events("start").at(0).openDescriptors, expected);
    EXPECT_EQ(SimulatedDaemon::events("start").at(1).openDescriptors, expected);
}

TEST_F(SpawnTest, ReadsTheConfigurationFileOfItsOwnSession) {
    SimulatedDaemon::script("gm absent\n");
    session.initialise(sessionConfiguration("[]", "0x1"));
    EXPECT_THAT(readFile("ptp4l.conf"), testing::HasSubstr("\ntransportSpecific 0x1\n"));
    session.start();
    EXPECT_TRUE(waitForCalls(Function::getTime, 1));
    ASSERT_TRUE(SimulatedDaemon::waitFor("request"));
    EXPECT_EQ(SimulatedDaemon::events("request").at(0).octets.substr(0, 2), "1d");
}

} // namespace
