#include <algorithm>
#include <memory>

#include <gmock/gmock.h>

#include "Interposed.h"
#include "SessionFixture.h"

namespace {

using std::chrono::milliseconds;

constexpr std::uint64_t ingressTime = 1700000000000000000;

/// How long a poll of the simulated daemon takes is not known, so lower bounds are checked on each
/// interval and upper bounds on the shortest of many.
class PacingTest : public SessionTest {
protected:
    void beginAt(std::uint64_t microsecondsAfterIngress, const std::string& script = "") {
        host.setTime(ingressTime + microsecondsAfterIngress * 1000);
        begin("clock fixed 1700000000000000000\n" + script);
    }

    /// The intervals between calls of a function, but for the first ones.
    std::vector<milliseconds> intervals(Function function, std::size_t skipped = 0) const {
        const auto calls = host.calls(function);
        std::vector<milliseconds> result;
        for (std::size_t i = skipped + 1; i < calls.size(); ++i) {
            result.push_back(
                std::chrono::duration_cast<milliseconds>(calls[i].at - calls[i - 1].at));
        }
        return result;
    }

    milliseconds shortest(Function function, std::size_t skipped = 0) const {
        const auto all = intervals(function, skipped);
        return *std::min_element(all.begin(), all.end());
    }

    /// Expects eight polls with the long sleep, to the microsecond, before each.
    void expectLongSleeps() {
        ASSERT_TRUE(waitForCalls(Function::getTime, 8));
        EXPECT_GE(shortest(Function::getTime), milliseconds(125));
        EXPECT_EQ(sleepsOfWorker().shortest, milliseconds(125));
        EXPECT_EQ(sleepsOfWorker().longest, milliseconds(125));
    }
};

TEST_F(PacingTest, FirstPollComesAfterTheLongSleep) {
    beginAt(112000);
    ASSERT_TRUE(waitForCalls(Function::getTime, 1));
    EXPECT_GE(host.calls(Function::getTime)[0].at - host.calls()[1].at, milliseconds(125));
}

TEST_F(PacingTest, PollsComeFastWhenASyncIsDue) {
    beginAt(120000);
    ASSERT_TRUE(waitForCalls(Function::getTime, 40));
    EXPECT_GE(shortest(Function::getTime), milliseconds(16));
    EXPECT_LT(shortest(Function::getTime), milliseconds(60));
}

TEST_F(PacingTest, PollsComeFastAfter2038WhenASyncIsDue) {
    // The second of the Sync is the last of 31 bits, that of the poll the first of 32.
    host.setTime(2147483648020000000);
    begin("clock fixed 2147483647900000000\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 40));
    EXPECT_GE(shortest(Function::getTime), milliseconds(16));
    EXPECT_LT(shortest(Function::getTime), milliseconds(60));
}

TEST_F(PacingTest, PollsAimAtTheNextSync) {
    beginAt(60000);
    ASSERT_TRUE(waitForCalls(Function::getTime, 20));
    EXPECT_GE(shortest(Function::getTime), milliseconds(68));
    EXPECT_LT(shortest(Function::getTime), milliseconds(125));
}

TEST_F(PacingTest, PollsComeSlowlyRightAfterASync) {
    beginAt(0);
    ASSERT_TRUE(waitForCalls(Function::getTime, 8));
    EXPECT_GE(shortest(Function::getTime), milliseconds(125));
}

TEST_F(PacingTest, PollsComeSlowlyWhenTheSyncIsOverdue) {
    beginAt(200000);
    ASSERT_TRUE(waitForCalls(Function::getTime, 8));
    EXPECT_GE(shortest(Function::getTime), milliseconds(125));
}

TEST_F(PacingTest, PollsComeSlowlyWhenTheHostIsBehindTheIngress) {
    host.setTime(ingressTime - 1);
    begin("clock fixed 1700000000000000000\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 8));
    EXPECT_GE(shortest(Function::getTime), milliseconds(125));
}

TEST_F(PacingTest, OfSixteenSyncsASecondEverySecondOneIsPassedOver) {
    // The daemon's clock is the host's.
    onEachPoll([this](int) {
        host.setTime(static_cast<std::uint64_t>(
            std::chrono::steady_clock::now().time_since_epoch() / std::chrono::nanoseconds(1)));
    });
    begin("clock monotonic\n"
          "sync-interval 0.0625\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 20));
    const auto calls = host.calls(Function::adjustTime);
    std::uint64_t shortest = UINT64_MAX;
    for (std::size_t i = 1; i < calls.size(); ++i) {
        shortest = std::min(shortest, calls[i].localTime - calls[i - 1].localTime);
    }
    EXPECT_EQ(shortest, 125000000U);
}

TEST_F(PacingTest, FailedFetchKeepsTheShortSleep) {
    beginAt(112000, "on TIME_STATUS_NP after 1 do length +1\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 40));
    // The first two are of start and of the good poll.
    EXPECT_GE(shortest(Function::updateMetaData, 2), milliseconds(16));
    EXPECT_LT(shortest(Function::updateMetaData, 2), milliseconds(60));
}

TEST_F(PacingTest, FailedFetchKeepsTheLongSleep) {
    beginAt(0, "on TIME_STATUS_NP after 1 do length +1\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 8));
    EXPECT_GE(shortest(Function::updateMetaData, 2), milliseconds(125));
}

TEST_F(PacingTest, HostErrorBringsTheLongSleep) {
    host.onCall([starter = std::this_thread::get_id()](const RecordingHost::Call& call,
                                                       zeerr_Status& status) {
        if (call.function == Function::updateMetaData && call.thread != starter) {
            status.code = -1;
        }
    });
    beginAt(112000);
    expectLongSleeps();
}

TEST_F(PacingTest, FailureOfTheFifoBringsTheLongSleep) {
    fifo.reset();
    beginAt(112000);
    expectLongSleeps();
}

} // namespace
