#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <future>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "Interposed.h"
#include "SessionFixture.h"
#include "SteeredClock.h"

namespace {

using std::chrono::hours;
using std::chrono::microseconds;
using std::chrono::milliseconds;
using std::chrono::minutes;
using std::chrono::nanoseconds;
using std::chrono::seconds;

/// Of each measurement.
constexpr nanoseconds jitter{50};

/// With a sanitizer, an hour takes a minute and more.
#if defined(__SANITIZE_THREAD__) || defined(__SANITIZE_ADDRESS__)
constexpr minutes longTime{10};
#else
constexpr minutes longTime{60};
#endif

/// Beyond that a clock is not steered, ppb.
constexpr double mostFrequency = 500000;

/// A proportional-integral servo, of which a clock gets its frequency and never a step.
class Servo {
public:
    /// @param offset  of the local clock
    /// @param elapsed since the last one
    /// @return the frequency, ppb
    double take(nanoseconds offset, nanoseconds elapsed) {
        const auto error = static_cast<double>(offset.count());
        const double sum = sum_ + 0.3 * error * std::chrono::duration<double>(elapsed).count();
        const double frequency = -(error + sum);
        if (std::abs(frequency) > mostFrequency) {
            return std::clamp(frequency, -mostFrequency, mostFrequency);
        }
        sum_ = sum;
        return frequency;
    }

private:
    double sum_ = 0; ///< ppb
};

/// A host whose clock follows the pairs, 50 ms off and 40 ppm fast at first, in a time of its own:
/// that passes while the plug-in's worker sleeps, and only then.
class SimulatedLoopTest : public SessionTest {
protected:
    SimulatedLoopTest()
        : clock(folder.path("clock"), milliseconds(50), 40000),
          sleeps_([this](nanoseconds duration) { clock.pass(duration); }) {
        host.onCall([this](const RecordingHost::Call& call, zeerr_Status&) { answer(call); });
    }

    /// The worker must not outlive what it uses.
    void TearDown() override { session.stop(); }

    /// Runs the loop for so long, with more lines for the daemon. @return false when it takes ages.
    [[nodiscard]] bool run(nanoseconds duration, const std::string& script = "") {
        duration_ = duration;
        // Without a log: it would be told of 170000 messages.
        writeFile(std::string(SimulatedDaemon::configFile) + ".sim", "clock steered clock\n"
                                                                     "jitter 50\n"
                                                                     "syncs-before-delay 0\n" +
                                                                         script);
        session.initialise();
        {
            const HeldPolls untilItIsReady;
            session.start();
            EXPECT_TRUE(waitUntil([] { return std::filesystem::exists("ptp4l.sock"); }));
        }
        const auto ended = end_.get_future().wait_for(minutes(5));
        session.stop();
        return ended == std::future_status::ready;
    }

    /// Called in each poll, after what it has found is told.
    std::function<void()> onPoll = [] {};

    SteeredClock clock;
    int pairs = 0;                 ///< that were followed in that time
    nanoseconds greatestChange{0}; ///< of the offset, from one of them to the next

private:
    void answer(const RecordingHost::Call& call) {
        if (call.function == Function::adjustTime) {
            take(call);
        } else if (call.function == Function::getTime) {
            onPoll();
            host.setTime(static_cast<std::uint64_t>(clock.local().count()));
            // Nobody is woken before: that would take longer than all else.
            if (clock.passed() >= duration_ && !std::exchange(hasEnded_, true)) {
                end_.set_value();
            }
        }
    }

    void take(const RecordingHost::Call& pair) {
        const nanoseconds local(pair.localTime);
        // Of a grandmaster that has gone there is no time to follow.
        if (local == nanoseconds(0)) {
            last_.reset();
            return;
        }
        const nanoseconds offset(static_cast<std::int64_t>(pair.localTime - pair.referenceTime));
        if (last_) {
            greatestChange = std::max(greatestChange, std::chrono::abs(offset - last_->offset));
        }
        clock.steer(servo_.take(offset, last_ ? local - last_->local : nanoseconds(0)));
        last_ = {local, offset};
        // Polls go on until the plug-in is stopped.
        pairs += hasEnded_ ? 0 : 1;
    }

    struct Pair {
        nanoseconds local;
        nanoseconds offset;
    };

    Servo servo_;
    std::optional<Pair> last_;
    nanoseconds duration_{0};
    bool hasEnded_ = false;
    std::promise<void> end_;
    const ToldSleeps sleeps_;
};

/// The greatest error of a clock in a time.
class Errors {
public:
    Errors(const SteeredClock& clock, nanoseconds begin, nanoseconds end = hours(24))
        : clock_(clock), begin_(begin), end_(end) {}

    void look() {
        if (clock_.passed() >= begin_ && clock_.passed() < end_) {
            greatest_ =
                std::max(greatest_.value_or(nanoseconds(0)), std::chrono::abs(clock_.error()));
        }
    }

    nanoseconds greatest() const { return greatest_.value(); }

private:
    const SteeredClock& clock_;
    const nanoseconds begin_;
    const nanoseconds end_;
    std::optional<nanoseconds> greatest_;
};

TEST_F(SimulatedLoopTest, LocksFrom50MillisecondsAnd40PpmAndStaysLockedForAnHour) {
    // 50 ms at 460 ppm take 109 s.
    Errors unlocked(clock, seconds(0), minutes(1));
    Errors locked(clock, minutes(3));
    onPoll = [&] {
        unlocked.look();
        locked.look();
    };
    ASSERT_TRUE(run(longTime));
    EXPECT_GE(unlocked.greatest(), milliseconds(50));
    EXPECT_LE(locked.greatest(), jitter);
    // Each Sync has become a pair, and none has shown a step: 500 ppm for 125 ms.
    EXPECT_NEAR(pairs, 8 * std::chrono::seconds(longTime).count(), 8);
    EXPECT_LE(greatestChange, microseconds(63));
}

TEST_F(SimulatedLoopTest, FollowsAnotherGrandmasterAfterATimeWithoutOne) {
    // It goes after three minutes, and five seconds later comes one that is 20 us ahead.
    constexpr int pollsBefore = 1440;
    Errors alone(clock, minutes(3), seconds(182));
    Errors locked(clock, minutes(4));
    onPoll = [&, polls = 0]() mutable {
        alone.look();
        locked.look();
        if (++polls == pollsBefore + 20) {
            clock.moveGrandmaster(microseconds(20));
        }
    };
    ASSERT_TRUE(run(minutes(6), "on TIME_STATUS_NP after 1440 times 1 do gm off\n"
                                "on TIME_STATUS_NP after 1480 times 1 do gm on\n"));
    EXPECT_EQ(qualities(), (std::vector<QualityReport>{waiting, usable, noRole, usable}));
    EXPECT_LE(alone.greatest(), 2 * jitter);
    EXPECT_LE(locked.greatest(), jitter);
    EXPECT_LE(greatestChange, microseconds(63));
}

TEST_F(SimulatedLoopTest, AnEpochOffsetPutsTheLocalClockBehindByAsMuch) {
    // It is added to the local times, which the host makes equal to the grandmaster's.
    Errors before(clock, minutes(3), seconds(182));
    nanoseconds last{0};
    onPoll = [&, polls = 0]() mutable {
        before.look();
        last = clock.error();
        if (++polls == 1500) {
            fifo->write({1000000});
        }
    };
    ASSERT_TRUE(run(minutes(5)));
    EXPECT_LE(before.greatest(), jitter);
    EXPECT_LE(std::chrono::abs(last + milliseconds(1)), jitter);
}

} // namespace
