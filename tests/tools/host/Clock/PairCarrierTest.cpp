#include "Clock/PairCarrier.h"

#include <cerrno>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;

namespace {

constexpr std::uint64_t ms = 1000000;
constexpr std::uint64_t second = 1000 * ms;

/// Of the clock, and of CLOCK_REALTIME at the same moment.
constexpr std::uint64_t local = 1800000037000000000;
constexpr std::uint64_t realtime = 1800000000000000000;

/// A clock that a test sets.
class SetClock : public LocalClock {
public:
    const std::string& name() const override { return name_; }
    std::optional<std::uint64_t> now() const override { return next->local; }
    std::optional<CrossTime> cross() override {
        errno = ENODEV;
        return next;
    }

    std::optional<CrossTime> next = CrossTime{local, realtime, 0};

private:
    const std::string name_ = "/dev/ptp7";
};

class PairCarrierTest : public testing::Test {
protected:
    /// Carries a local time at a cross time stamp.
    PairCarrier::Result carry(const CrossTime& at, std::uint64_t time) {
        clock.next = at;
        return carrier.carry(clock, time);
    }

    SetClock clock;
    int named = 0;
    PairCarrier carrier{[this](std::uint64_t time, const std::string& name) {
        ++named;
        return std::to_string(time) + " is not of " + name;
    }};
};

} // namespace

TEST_F(PairCarrierTest, ATimeIsCarriedByTheCrossTimeStampAndItsAge) {
    const auto result = carry({local, realtime, 150}, local - 20 * ms);
    ASSERT_TRUE(result.time);
    EXPECT_EQ(result.time->realtime, realtime - 20 * ms);
    EXPECT_FALSE(result.news);
}

TEST_F(PairCarrierTest, WithoutARateAHundredMillionthsOfTheAgeAreUncertain) {
    EXPECT_EQ(carry({local, realtime, 150}, local - 20 * ms).time->uncertainty, 150U + 2000U);
}

TEST_F(PairCarrierTest, BetweenTwoCrossTimeStampsTheClocksRateDoesNotMatter) {
    // CLOCK_REALTIME runs 40 ppm faster: 5000 ns in 125 ms.
    carry({local, realtime, 300}, local - 20 * ms);
    const auto result =
        carry({local + 125 * ms, realtime + 125 * ms + 5000, 100}, local + 100 * ms);
    EXPECT_EQ(result.time->realtime, realtime + 100 * ms + 4000);
    // A fifth of the way to the one before.
    EXPECT_EQ(result.time->uncertainty, 80U + 60U);
}

TEST_F(PairCarrierTest, BeforeBothCrossTimeStampsTheUncertaintyGrows) {
    carry({local, realtime, 300}, local - 20 * ms);
    const auto result =
        carry({local + 100 * ms, realtime + 100 * ms + 1000, 100}, local - 100 * ms);
    EXPECT_EQ(result.time->realtime, realtime - 100 * ms - 1000);
    EXPECT_EQ(result.time->uncertainty, 600U + 100U);
}

TEST_F(PairCarrierTest, AClockThatWasSetHasNoRate) {
    carry({local, realtime, 0}, local);
    const auto result =
        carry({local + 125 * ms, realtime + 125 * ms + second, 0}, local + 115 * ms);
    EXPECT_EQ(result.time->realtime, realtime + 115 * ms + second);
    EXPECT_EQ(result.time->uncertainty, 1000U);
}

TEST_F(PairCarrierTest, CrossTimeStampsTooFarOrTooNearHaveNoRate) {
    for (const std::uint64_t distance : {2001 * ms, 9 * ms}) {
        carrier.begin();
        carry({local, realtime, 0}, local);
        const auto result =
            carry({local + distance, realtime + distance + 5000, 0}, local + distance - ms);
        EXPECT_EQ(result.time->realtime, realtime + distance + 5000 - ms) << distance;
        EXPECT_EQ(result.time->uncertainty, 100U) << distance;
    }
}

TEST_F(PairCarrierTest, TimesNearTheEndsOfTheirRangeAreCarriedModulo2To64) {
    const auto result = carry({5, realtime, 0}, UINT64_MAX - 4);
    ASSERT_TRUE(result.time);
    EXPECT_EQ(result.time->realtime, realtime - 10);
}

TEST_F(PairCarrierTest, TwoSecondsEitherWayAreTheClocks) {
    EXPECT_TRUE(carry({local, realtime, 0}, local - 2 * second).time);
    EXPECT_TRUE(carry({local, realtime, 0}, local + 2 * second).time);
    EXPECT_FALSE(carry({local, realtime, 0}, local - 2 * second - 1).time);
    EXPECT_FALSE(carry({local, realtime, 0}, local + 2 * second + 1).time);
}

TEST_F(PairCarrierTest, ARefusalIsAnErrorWhenItBeginsAndCountedWhenItHasEnded) {
    const CrossTime now{local, realtime, 0};
    const auto first = carry(now, 990);
    EXPECT_FALSE(first.time);
    ASSERT_TRUE(first.news);
    EXPECT_EQ(first.news->name, "error");
    EXPECT_EQ(first.news->text, "clock: 990 is not of /dev/ptp7");
    for (int i = 0; i < 4; ++i) {
        EXPECT_FALSE(carry(now, 990).news);
    }
    EXPECT_EQ(carrier.refused(), 5U);
    EXPECT_EQ(named, 1);
    const auto good = carry(now, local);
    EXPECT_TRUE(good.time);
    ASSERT_TRUE(good.news);
    EXPECT_EQ(good.news->name, "clock");
    EXPECT_EQ(good.news->members["refused"], 5);
    EXPECT_EQ(carrier.refused(), 0U);
    EXPECT_FALSE(carry(now, local).news);
    EXPECT_EQ(carry(now, 990).news->name, "error");
}

TEST_F(PairCarrierTest, AClockThatCannotBeReadRefusesAndSaysWhy) {
    clock.next.reset();
    const auto result = carrier.carry(clock, local);
    EXPECT_FALSE(result.time);
    ASSERT_TRUE(result.news);
    EXPECT_EQ(result.news->text, "clock: /dev/ptp7 cannot be read: No such device");
    EXPECT_FALSE(carrier.carry(clock, local).news);
}

TEST_F(PairCarrierTest, TheEpochOffsetIsTakenOff) {
    carrier.epochOffset(-1000);
    EXPECT_EQ(carry({local, realtime, 0}, local - 1000 - ms).time->realtime, realtime - ms);
    carrier.epochOffset(static_cast<std::int64_t>(realtime));
    const auto result = carry({local, realtime, 0}, local + realtime - ms);
    ASSERT_TRUE(result.time);
    EXPECT_EQ(result.time->realtime, realtime - ms);
}

TEST_F(PairCarrierTest, TheEpochOffsetOfBeforeMayStillBeInUse) {
    carrier.epochOffset(static_cast<std::int64_t>(100 * second));
    EXPECT_EQ(carry({local, realtime, 0}, local - ms).time->realtime, realtime - ms);
    carrier.epochOffset(static_cast<std::int64_t>(200 * second));
    EXPECT_FALSE(carry({local, realtime, 0}, local - ms).time);
}

TEST_F(PairCarrierTest, ANewSessionHasNoEpochOffsetAndNoRefusal) {
    carrier.epochOffset(static_cast<std::int64_t>(100 * second));
    EXPECT_TRUE(carry({local, realtime, 0}, 990).news);
    carrier.begin();
    EXPECT_EQ(carrier.refused(), 0U);
    EXPECT_TRUE(carry({local, realtime, 0}, 990).news);
    EXPECT_TRUE(carry({local, realtime, 0}, local - ms).time);
}
