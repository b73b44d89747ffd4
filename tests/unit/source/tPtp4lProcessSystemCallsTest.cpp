// A program of its own: vfork, kill, waitpid and nanosleep are those below, which fail, or signal
// the child, or write down what they do, or do nothing else.

#include "tPtp4lProcess.h"

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <ctime>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <syslog.h>
#include <unistd.h>

#include "errors/Exception.h"
#include "support/ChildProgram.h"
#include "support/SyslogCapture.h"
#include "support/TemporaryFolder.h"

using std::chrono::nanoseconds;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using zekelVantel::tPtp4lProcess;

namespace {

int vforkError = 0;
int signalToTheChild = 0;
std::vector<std::pair<pid_t, int>> kills;
std::vector<pid_t> waits;
bool sleepsPassAtOnce = false;
std::vector<nanoseconds> passedSleeps;

} // namespace

extern "C" {

pid_t vfork() noexcept {
    if (vforkError != 0) {
        errno = vforkError;
        return -1;
    }
    const pid_t pid = fork();
    if (pid == 0 && signalToTheChild != 0) {
        syscall(SYS_kill, getpid(), signalToTheChild);
    }
    return pid;
}

int kill(pid_t pid, int signal) noexcept {
    kills.emplace_back(pid, signal);
    // A mistake must not end those who run the tests: these are whole groups, or all there are.
    if (pid <= 0) {
        errno = ESRCH;
        return -1;
    }
    return static_cast<int>(syscall(SYS_kill, pid, signal));
}

pid_t waitpid(pid_t pid, int* status, int options) {
    waits.push_back(pid);
    return static_cast<pid_t>(syscall(SYS_wait4, pid, status, options, nullptr));
}

int nanosleep(const timespec* duration, timespec* rest) {
    if (sleepsPassAtOnce) {
        passedSleeps.push_back(std::chrono::seconds(duration->tv_sec) +
                               nanoseconds(duration->tv_nsec));
        return 0;
    }
    errno = clock_nanosleep(CLOCK_MONOTONIC, 0, duration, rest);
    return errno == 0 ? 0 : -1;
}

} // extern "C"

namespace {

class PtpProcessSystemCallsTest : public testing::Test {
protected:
    PtpProcessSystemCallsTest() {
        vforkError = 0;
        signalToTheChild = 0;
        kills.clear();
        waits.clear();
        sleepsPassAtOnce = false;
        passedSleeps.clear();
    }
    ~PtpProcessSystemCallsTest() override { endChild(pid); }

    void spawn(const std::string& config) {
        writeFile("child.cfg", config + "\nreport child.txt");
        process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {});
        pid = ChildReport("child.txt").pid();
    }

    /// A child that ends at once, and is seen to have done so.
    void spawnAndSeeTheDeath() {
        writeFile("child.cfg", "exit 0");
        process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {});
        EXPECT_TRUE(waitUntil([&] { return process.hasDied(); }));
    }

    /// Terminates a child that ignores SIGTERM, without the time that it takes.
    void spawnAndKill() {
        spawn("ignore " + std::to_string(SIGTERM));
        sleepsPassAtOnce = true;
        process.terminate();
        sleepsPassAtOnce = false;
    }

    /// Expects that there is no child, which is known without a look at anybody's number.
    void expectNoChild() {
        waits.clear();
        kills.clear();
        EXPECT_TRUE(process.hasDied());
        process.terminate();
        EXPECT_TRUE(process.hasDied());
        EXPECT_THAT(waits, IsEmpty());
        EXPECT_THAT(kills, IsEmpty());
    }

    const TemporaryFolder folder;
    const SyslogCapture log;
    tPtp4lProcess process;
    pid_t pid = -1;
};

TEST_F(PtpProcessSystemCallsTest, FailingVforkIsLoggedAndThrown) {
    vforkError = EAGAIN;
    try {
        process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {"eth0"});
        FAIL() << "nothing thrown";
    } catch (zeerr::Exception& exception) {
        EXPECT_EQ(exception.status().code, -52008);
        EXPECT_STREQ(exception.what(),
                     R"({"error_constant":"zeoskerr_osFault","file":"tPtp4lTimeRef",)"
                     R"("line":70,"component":"vantel_bc"})");
    }
    EXPECT_THAT(log.lines(), ElementsAre(SyslogCapture::Line{
                                 LOG_ERR, "Unable to fork subprocess in vantel, got errno: "
                                          "Resource temporarily unavailable"}));
}

TEST_F(PtpProcessSystemCallsTest, FailingVforkLeavesNoChildToTerminate) {
    vforkError = ENOMEM;
    EXPECT_THROW(process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {}), zeerr::Exception);
    expectNoChild();
    EXPECT_EQ(log.count("Unable to fork subprocess in vantel, got errno: Cannot allocate memory"),
              1);
}

TEST_F(PtpProcessSystemCallsTest, FailingVforkRestoresTheSignalMask) {
    const BlockedSignals blocked({SIGUSR1});
    vforkError = EAGAIN;
    EXPECT_THROW(process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {}), zeerr::Exception);
    EXPECT_THAT(blockedSignals(), ElementsAre(SIGUSR1));
}

struct HandlerRuns {
    volatile sig_atomic_t here;
    volatile sig_atomic_t inTheChild;
};

HandlerRuns* runs = nullptr;
pid_t host = -1;

/// A handler of the host, which writes down in what process it runs.
class PtpProcessHandlerTest : public PtpProcessSystemCallsTest {
protected:
    void SetUp() override {
        void* const shared = mmap(nullptr, sizeof(HandlerRuns), PROT_READ | PROT_WRITE,
                                  MAP_SHARED | MAP_ANONYMOUS, -1, 0);
        ASSERT_NE(shared, MAP_FAILED);
        runs = static_cast<HandlerRuns*>(shared);
        host = getpid();
    }
    void TearDown() override { munmap(runs, sizeof(HandlerRuns)); }

    static void handler(int) { (getpid() == host ? runs->here : runs->inTheChild) = 1; }
};

TEST_F(PtpProcessHandlerTest, SignalThatEndsTheChildBeforeItsProgramIsNotHandled) {
    writeFile("child.cfg", "exit 0");
    for (const int signal : {SIGUSR1, SIGUSR2, SIGINT, SIGHUP, SIGALRM, SIGTERM, SIGRTMIN}) {
        const Disposition handled(signal, &handler);
        signalToTheChild = signal;
        process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {});
        int status = 0;
        ASSERT_GT(waitpid(-1, &status, 0), 0);
        EXPECT_TRUE(WIFSIGNALED(status)) << signal;
        EXPECT_EQ(WTERMSIG(status), signal);
        EXPECT_EQ(runs->inTheChild, 0) << signal;
    }
}

TEST_F(PtpProcessHandlerTest, SignalThatEndsNothingIsNotHandledAndTheProgramRuns) {
    for (const int signal : {SIGCHLD, SIGWINCH, SIGURG, SIGCONT}) {
        const Disposition handled(signal, &handler);
        signalToTheChild = signal;
        std::remove("child.txt");
        spawn("");
        EXPECT_FALSE(process.hasDied()) << signal;
        process.terminate();
        EXPECT_EQ(runs->inTheChild, 0) << signal;
    }
}

TEST_F(PtpProcessHandlerTest, HandlerOfTheHostStays) {
    const Disposition handled(SIGUSR1, &handler);
    spawn("");
    ASSERT_EQ(raise(SIGUSR1), 0);
    EXPECT_EQ(runs->here, 1);
    EXPECT_EQ(runs->inTheChild, 0);
}

TEST_F(PtpProcessSystemCallsTest, SpawnSucceedsAfterOneThatFailed) {
    vforkError = EAGAIN;
    EXPECT_THROW(process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {}), zeerr::Exception);
    vforkError = 0;
    spawn("");
    EXPECT_FALSE(process.hasDied());
    process.terminate();
    EXPECT_THAT(kills, ElementsAre(Pair(pid, SIGTERM)));
}

TEST_F(PtpProcessSystemCallsTest, TerminateSendsOneSigtermAndTheSecondTimeNothing) {
    spawn("");
    process.terminate();
    EXPECT_THAT(kills, ElementsAre(Pair(pid, SIGTERM)));
    process.terminate();
    EXPECT_EQ(kills.size(), 1U);
    EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(PtpProcessSystemCallsTest, WithoutASpawnNobodyIsWaitedForOrSignalled) {
    expectNoChild();
}

TEST_F(PtpProcessSystemCallsTest, TerminatedChildIsNotWaitedForOrSignalledAgain) {
    spawn("");
    process.terminate();
    expectNoChild();
}

// Its number may be somebody else's by then.
TEST_F(PtpProcessSystemCallsTest, ReapedChildIsNotWaitedForOrSignalledAgain) {
    spawnAndSeeTheDeath();
    expectNoChild();
}

TEST_F(PtpProcessSystemCallsTest, KilledChildIsNotWaitedForOrSignalledAgain) {
    spawnAndKill();
    expectNoChild();
}

TEST_F(PtpProcessSystemCallsTest, ReapedChildIsNeverSignalled) {
    spawnAndSeeTheDeath();
    process.terminate();
    EXPECT_THAT(kills, IsEmpty());
    EXPECT_THAT(log.lines(), IsEmpty());
    EXPECT_TRUE(process.hasDied());
}

TEST_F(PtpProcessSystemCallsTest, ChildThatDiedUnseenIsReapedAndNotSignalled) {
    writeFile("child.cfg", "exit 0");
    process.spawn(VANTEL_CHILD_PROGRAM, "./child.cfg", {});
    siginfo_t info{};
    ASSERT_EQ(waitid(P_ALL, 0, &info, WEXITED | WNOWAIT), 0);
    process.terminate();
    EXPECT_THAT(kills, IsEmpty());
    EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1);
}

TEST_F(PtpProcessSystemCallsTest, ChildThatIgnoresSigtermIsKilledAfterTenSeconds) {
    spawn("ignore " + std::to_string(SIGTERM));
    const auto begin = std::chrono::steady_clock::now();
    process.terminate();
    EXPECT_GE(std::chrono::steady_clock::now() - begin, std::chrono::seconds(10));
    EXPECT_THAT(kills, ElementsAre(Pair(pid, SIGTERM), Pair(pid, SIGKILL)));
    EXPECT_THAT(log.lines(), ElementsAre(SyslogCapture::Line{
                                 LOG_ERR, "Killing ptp4l subprocess (pid " + std::to_string(pid) +
                                              ") using SIGKILL.x"}));
    EXPECT_TRUE(process.hasDied()) << "it is no child of this object any more";
    int status = 0;
    ASSERT_EQ(waitpid(pid, &status, 0), pid) << "it was not waited for";
    EXPECT_EQ(WTERMSIG(status), SIGKILL);
}

TEST_F(PtpProcessSystemCallsTest,
       ChildThatIgnoresSigtermIsKilledAfterAThousandSleepsOfTenMilliseconds) {
    spawnAndKill();
    EXPECT_EQ(passedSleeps.size(), 1000U);
    EXPECT_THAT(passedSleeps, Each(std::chrono::milliseconds(10)));
    EXPECT_THAT(kills, ElementsAre(Pair(pid, SIGTERM), Pair(pid, SIGKILL)));
}

} // namespace
