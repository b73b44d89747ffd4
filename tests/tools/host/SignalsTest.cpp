#include "Signals.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

using namespace vantelhost;

namespace {

class SignalsTest : public testing::Test {
protected:
    SignalsTest() { pthread_sigmask(SIG_SETMASK, nullptr, &mask); }
    ~SignalsTest() override { pthread_sigmask(SIG_SETMASK, &mask, nullptr); }

    Signals::News waitForNews() {
        pollfd input{signals.descriptor(), POLLIN, 0};
        EXPECT_EQ(::poll(&input, 1, 20000), 1);
        return signals.take().value();
    }

    sigset_t mask;
    Signals signals;
};

} // namespace

TEST_F(SignalsTest, WithoutASignalThereIsNothingToTake) {
    EXPECT_FALSE(signals.take().has_value());
    EXPECT_FALSE(signals.stopHasCome());
}

TEST_F(SignalsTest, AStopHasComeBeforeAndAfterItIsTaken) {
    ::kill(::getpid(), SIGINT);
    EXPECT_TRUE(signals.stopHasCome());
    EXPECT_EQ(waitForNews().stop, "SIGINT");
    EXPECT_TRUE(signals.stopHasCome());
}

TEST_F(SignalsTest, TheEndOfAChildIsToldAlsoWhenItIsReaped) {
    const pid_t child = ::fork();
    if (child == 0) {
        ::_exit(3);
    }
    ASSERT_EQ(::waitpid(child, nullptr, 0), child);
    const auto end = waitForNews().childEnd.value();
    EXPECT_EQ(end.pid, child);
    EXPECT_FALSE(end.bySignal);
    EXPECT_EQ(end.status, 3);
    EXPECT_FALSE(signals.stopHasCome());
}

TEST_F(SignalsTest, AChildThatIsKilledIsToldWithTheSignal) {
    const pid_t child = ::fork();
    if (child == 0) {
        ::pause();
        ::_exit(0);
    }
    ::kill(child, SIGKILL);
    const auto end = waitForNews().childEnd.value();
    EXPECT_TRUE(end.bySignal);
    EXPECT_EQ(end.status, SIGKILL);
    ::waitpid(child, nullptr, 0);
}

TEST_F(SignalsTest, AStopComesBeforeTheEndOfAChild) {
    const pid_t child = ::fork();
    if (child == 0) {
        ::_exit(0);
    }
    ASSERT_EQ(::waitpid(child, nullptr, 0), child);
    ::kill(::getpid(), SIGTERM);
    EXPECT_EQ(waitForNews().stop, "SIGTERM");
    EXPECT_TRUE(waitForNews().childEnd.has_value());
}

TEST_F(SignalsTest, ANewSizeOfTheTerminalIsNoStop) {
    ::kill(::getpid(), SIGWINCH);
    const auto news = waitForNews();
    EXPECT_EQ(news.stop, "");
    EXPECT_FALSE(news.childEnd.has_value());
    EXPECT_FALSE(signals.stopHasCome());
}

TEST_F(SignalsTest, AHangupIsAStopUnlessItAsksToReadAgain) {
    ::kill(::getpid(), SIGHUP);
    EXPECT_TRUE(signals.stopHasCome());
    const auto stop = waitForNews();
    EXPECT_EQ(stop.stop, "SIGHUP");
    EXPECT_FALSE(stop.reread);
}

TEST(RereadingSignals, AHangupIsNoStop) {
    sigset_t before;
    pthread_sigmask(SIG_SETMASK, nullptr, &before);
    {
        Signals signals(Hangup::reread);
        ::kill(::getpid(), SIGHUP);
        EXPECT_FALSE(signals.stopHasCome());
        const auto news = signals.take().value();
        EXPECT_TRUE(news.reread);
        EXPECT_EQ(news.stop, "");
        ::kill(::getpid(), SIGTERM);
        EXPECT_TRUE(signals.stopHasCome());
        EXPECT_EQ(signals.take().value().stop, "SIGTERM");
    }
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
}
