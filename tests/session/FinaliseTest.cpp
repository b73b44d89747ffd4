#include <csignal>
#include <thread>

#include <sys/wait.h>
#include <unistd.h>

#include "SessionFixture.h"

namespace {

class FinaliseTest : public SessionTest {
protected:
    /// In a process of its own, which it ends: finalises a session that runs and is never stopped.
    /// @return 0 when finalise waits while the session goes on.
    [[noreturn]] void finaliseUnstopped() {
        begin("gm present\n");
        bool good = waitForCalls(Function::getTime, 1);
        // Never ends, so it is never waited for.
        std::thread([this] { session.finalise(); }).detach();
        const std::size_t calls = host.calls(Function::getTime).size();
        good = good && waitForCalls(Function::getTime, calls + 10);
        good = good && *session.slot() != nullptr && threadCount() == threadsBefore.count() + 3;
        _exit(good ? 0 : 1);
    }
};

TEST_F(FinaliseTest, WaitsForASessionThatWasNeverStopped) {
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        finaliseUnstopped();
    }
    int status = -1;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_EQ(kill(SimulatedDaemon::events("start").at(0).pid, SIGKILL), 0);
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0);
}

TEST_F(FinaliseTest, OfASessionThatWasNotStartedReturns) {
    session.initialise();
    EXPECT_NE(*session.slot(), nullptr);
    session.finalise();
    EXPECT_TRUE(host.calls().empty());
}

TEST_F(FinaliseTest, AfterStopReturns) {
    begin("gm present\n");
    session.stop();
    session.finalise();
    expectOwnThreads(0);
    EXPECT_FALSE(hasChildren());
}

} // namespace
