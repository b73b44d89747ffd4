#include "tPtp4lProcess.h"

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <thread>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include "support/ChildProgram.h"
#include "support/Descriptors.h"
#include "support/TemporaryFolder.h"
#include "tSharedFifo.h"
#include "tUdsMsgInterface.h"

using testing::Contains;
using testing::ElementsAre;
using testing::EndsWith;
using testing::IsEmpty;
using testing::Not;
using zekelVantel::tPtp4lProcess;

namespace {

constexpr char program[] = VANTEL_CHILD_PROGRAM;

class PtpProcessTest : public testing::Test {
protected:
    ~PtpProcessTest() override { endChild(pid); }

    void spawn(const std::string& config, const std::vector<std::string>& interfaces = {}) {
        writeFile("child.cfg", config);
        process.spawn(program, "./child.cfg", interfaces);
    }

    /// Starts a child and waits until it says what it was given.
    ChildReport spawnReporting(const std::vector<std::string>& interfaces = {},
                               const std::string& config = "report child.txt") {
        spawn(config, interfaces);
        const ChildReport report("child.txt");
        pid = report.pid();
        return report;
    }

    bool hasDiedSoon() {
        return waitUntil([&] { return process.hasDied(); });
    }

    /// Whether nothing is left of the child, not even its status.
    bool isReaped() const { return waitpid(pid, nullptr, WNOHANG) == -1 && errno == ECHILD; }

    const TemporaryFolder folder;
    tPtp4lProcess process;
    pid_t pid = -1;
};

TEST_F(PtpProcessTest, WithoutInterfacesTheConfigFileIsTheLastArgument) {
    EXPECT_THAT(spawnReporting().all("argument"), ElementsAre(program, "-f", "./child.cfg"));
}

TEST_F(PtpProcessTest, InterfacesFollowTheConfigFileInOrder) {
    EXPECT_THAT(spawnReporting({"eth1", "eth0", "with blank", "", "-i"}).all("argument"),
                ElementsAre(program, "-f", "./child.cfg", "-i", "eth1", "-i", "eth0", "-i",
                            "with blank", "-i", "", "-i", "-i"));
}

TEST_F(PtpProcessTest, EnvironmentIsEmpty) {
    ASSERT_EQ(setenv("VANTEL_TEST_VARIABLE", "value", 1), 0);
    const ChildReport report = spawnReporting();
    unsetenv("VANTEL_TEST_VARIABLE");
    EXPECT_THAT(report.all("variable"), IsEmpty());
}

TEST_F(PtpProcessTest, ChildOfAHostThatBlocksAndIgnoresIsStillEndedBySigterm) {
    const Disposition ignoredTerm(SIGTERM, SIG_IGN);
    const BlockedSignals blocked({SIGTERM, SIGCHLD, SIGINT, SIGUSR1});
    const ChildReport report = spawnReporting();
    EXPECT_THAT(report.all("SigBlk"), ElementsAre("0000000000000000"));
    EXPECT_FALSE(report.has("SigIgn", SIGTERM));
    EXPECT_EQ(kill(pid, SIGTERM), 0);
    int status = 0;
    ASSERT_EQ(waitpid(pid, &status, 0), pid);
    EXPECT_TRUE(WIFSIGNALED(status));
    EXPECT_EQ(WTERMSIG(status), SIGTERM);
}

TEST_F(PtpProcessTest, ChildOfAHostThatIgnoresItsChildrenDoesNotIgnoreItsOwn) {
    const Disposition ignoredChildren(SIGCHLD, SIG_IGN);
    EXPECT_FALSE(spawnReporting().has("SigIgn", SIGCHLD));
}

TEST_F(PtpProcessTest, ChildOfAHostThatIgnoresSigintIgnoresItToo) {
    const Disposition ignoredInterrupt(SIGINT, SIG_IGN);
    const Disposition ignoredHangUp(SIGHUP, SIG_IGN);
    const ChildReport report = spawnReporting();
    EXPECT_TRUE(report.has("SigIgn", SIGINT));
    EXPECT_TRUE(report.has("SigIgn", SIGHUP));
    EXPECT_FALSE(report.has("SigIgn", SIGTERM));
    EXPECT_FALSE(report.has("SigIgn", SIGCHLD));
}

TEST_F(PtpProcessTest, SignalThatTheHostHandlesIsAtItsDefaultInTheChild) {
    const Disposition handled(SIGUSR1, [](int) {});
    EXPECT_FALSE(spawnReporting().has("SigIgn", SIGUSR1));
    EXPECT_EQ(kill(pid, SIGUSR1), 0);
    int status = 0;
    ASSERT_EQ(waitpid(pid, &status, 0), pid);
    EXPECT_TRUE(WIFSIGNALED(status));
    EXPECT_EQ(WTERMSIG(status), SIGUSR1);
}

struct HandlerRuns {
    std::atomic<pid_t> host;
    std::atomic<int> here;
    std::atomic<int> inAChild;
};

HandlerRuns* runs = nullptr;

/// Spawns children while another thread signals the whole process group, to which they belong.
/// @return the status of the process that did, a group of its own.
int spawnUnderSignals(int children) {
    const pid_t spawner = fork();
    if (spawner != 0) {
        int status = -1;
        waitpid(spawner, &status, 0);
        return status;
    }
    setpgid(0, 0);
    runs->host = getpid();
    std::signal(SIGUSR1, [](int) { ++(getpid() == runs->host ? runs->here : runs->inAChild); });
    std::atomic<bool> stop{false};
    std::thread signals([&] {
        while (!stop) {
            kill(0, SIGUSR1);
            std::this_thread::sleep_for(std::chrono::microseconds(20));
        }
    });
    for (int child = 0; child < children; ++child) {
        tPtp4lProcess process;
        process.spawn(program, "./child.cfg", {});
        while (!process.hasDied()) {
            std::this_thread::sleep_for(std::chrono::microseconds(100));
        }
    }
    stop = true;
    signals.join();
    _exit(0);
}

TEST(PtpProcessHandlerTest, HandlerOfTheHostNeverRunsInAChild) {
    const TemporaryFolder folder;
    writeFile("child.cfg", "exit 0");
    void* const shared = mmap(nullptr, sizeof(HandlerRuns), PROT_READ | PROT_WRITE,
                              MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    ASSERT_NE(shared, MAP_FAILED);
    runs = new (shared) HandlerRuns{};
    EXPECT_EQ(spawnUnderSignals(100), 0);
    EXPECT_GT(runs->here, 0);
    EXPECT_EQ(runs->inAChild, 0);
    munmap(shared, sizeof(HandlerRuns));
}

TEST_F(PtpProcessTest, CallersSignalMaskIsRestored) {
    const BlockedSignals blocked({SIGTERM, SIGUSR1});
    spawnReporting();
    EXPECT_THAT(blockedSignals(), ElementsAre(SIGUSR1, SIGTERM));
}

TEST_F(PtpProcessTest, CallersDispositionsStay) {
    const Disposition ignoredTerm(SIGTERM, SIG_IGN);
    spawnReporting();
    struct sigaction now {};
    ASSERT_EQ(sigaction(SIGTERM, nullptr, &now), 0);
    EXPECT_EQ(now.sa_handler, SIG_IGN);
}

TEST_F(PtpProcessTest, ChildInheritsNoDescriptorOfThePlugIn) {
    zeerr::LocalStatus status;
    zekelVantel::tSharedFifo fifo("./fifo", true, status);
    fifo.open(status);
    zekelVantel::tUdsMsgInterface interface;
    interface.open("./socket", status);
    ASSERT_EQ(status.code, 0);
    struct stat attributes {};
    ASSERT_EQ(fstat(descriptorBoundTo("./socket"), &attributes), 0);
    const auto descriptors = spawnReporting().all("descriptor");
    EXPECT_THAT(descriptors, Not(IsEmpty()));
    EXPECT_THAT(descriptors, Not(Contains(EndsWith("/fifo"))));
    EXPECT_THAT(descriptors, Not(Contains("socket:[" + std::to_string(attributes.st_ino) + "]")));
}

TEST_F(PtpProcessTest, MissingProgramDiesWithStatus255) {
    process.spawn("./missing", "./child.cfg", {"eth0"});
    siginfo_t info{};
    ASSERT_EQ(waitid(P_ALL, 0, &info, WEXITED | WNOWAIT), 0);
    EXPECT_EQ(info.si_code, CLD_EXITED);
    EXPECT_EQ(info.si_status, 255);
    EXPECT_TRUE(hasDiedSoon());
}

TEST_F(PtpProcessTest, ProgramThatMayNotBeExecutedDiesToo) {
    writeFile("text", "no program");
    process.spawn("./text", "./child.cfg", {});
    EXPECT_TRUE(hasDiedSoon());
}

TEST_F(PtpProcessTest, ProgramThatEndsAtOnceHasDiedOnceAndForAll) {
    spawn("exit 3");
    EXPECT_TRUE(hasDiedSoon());
    EXPECT_TRUE(process.hasDied());
    EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1);
}

TEST_F(PtpProcessTest, RunningProgramHasNotDied) {
    spawnReporting();
    EXPECT_FALSE(process.hasDied());
    EXPECT_EQ(kill(pid, SIGKILL), 0);
    EXPECT_TRUE(hasDiedSoon());
    EXPECT_TRUE(isReaped());
}

TEST_F(PtpProcessTest, HasDiedIsSeenWhenTheHostIgnoresItsChildren) {
    const Disposition ignoredChildren(SIGCHLD, SIG_IGN);
    spawnReporting();
    EXPECT_FALSE(process.hasDied());
    EXPECT_EQ(kill(pid, SIGKILL), 0);
    EXPECT_TRUE(hasDiedSoon());
}

TEST_F(PtpProcessTest, WithoutASpawnThereIsNoChild) {
    EXPECT_TRUE(process.hasDied());
    process.terminate();
    EXPECT_TRUE(process.hasDied());
}

TEST_F(PtpProcessTest, TerminateEndsAndReapsTheChild) {
    spawnReporting();
    process.terminate();
    EXPECT_TRUE(isReaped());
    EXPECT_TRUE(process.hasDied());
}

TEST_F(PtpProcessTest, TerminateWorksWhenTheHostIgnoresItsChildren) {
    const Disposition ignoredChildren(SIGCHLD, SIG_IGN);
    spawnReporting();
    process.terminate();
    EXPECT_EQ(kill(pid, 0), -1);
    EXPECT_EQ(errno, ESRCH);
}

TEST_F(PtpProcessTest, NextChildCanBeSpawnedAfterTerminate) {
    const pid_t former = spawnReporting().pid();
    process.terminate();
    std::filesystem::remove("child.txt");
    EXPECT_NE(spawnReporting().pid(), former);
    EXPECT_FALSE(process.hasDied());
    process.terminate();
    EXPECT_TRUE(isReaped());
}

TEST_F(PtpProcessTest, DestructionLeavesTheChildAlone) {
    {
        tPtp4lProcess another;
        writeFile("child.cfg", "report child.txt");
        another.spawn(program, "./child.cfg", {});
        pid = ChildReport("child.txt").pid();
    }
    EXPECT_EQ(waitpid(pid, nullptr, WNOHANG), 0);
}

} // namespace
