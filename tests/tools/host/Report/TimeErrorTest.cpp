#include "Report/TimeError.h"

#include <cmath>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Report/PairSeries.h"
#include "Report/TimeErrorFigures.h"

using namespace vantelhost;

namespace {

constexpr std::uint64_t eighth = 125000000;

/// Eight pairs a second, without gaps.
template <typename OffsetOf>
TimeErrorFigures figuresOfPairs(std::uint64_t count, OffsetOf offsetOf) {
    PairSeries pairs;
    for (std::uint64_t i = 0; i < count; ++i) {
        const double seconds = static_cast<double>(i) / 8;
        pairs.add({seconds, i * eighth, offsetOf(seconds), 0});
    }
    pairs.finish();
    return figuresOf(pairs);
}

double valueOf(const std::vector<TauValue>& values, double tau) {
    for (const auto& each : values) {
        if (each.tau == tau) {
            return each.value;
        }
    }
    ADD_FAILURE() << "there is no tau of " << tau;
    return 0;
}

} // namespace

TEST(TimeError, OfAConstantOffsetIsConstant) {
    // Behind an epoch offset of 37 s.
    const auto figures = figuresOfPairs(20000, [](double) { return 37000000042; });
    EXPECT_EQ(figures.interval, 0.125);
    EXPECT_EQ(figures.seconds, 2500);
    EXPECT_EQ(figures.largest(), 37000000042);
    EXPECT_EQ(figures.mean, 37000000042);
    EXPECT_EQ(figures.averages, 2U);
    EXPECT_EQ(figures.constantError(), 37000000042);
    EXPECT_EQ(figures.lowPassRange, 0);
    EXPECT_EQ(figures.highPassRange, 0);
    EXPECT_EQ(valueOf(figures.low.mtie, 1000), 0);
    EXPECT_EQ(valueOf(figures.low.tdev, 512), 0);
}

TEST(TimeError, OfAFrequencyOffsetIsItsProductWithTime) {
    // 8 ns a second. The filter lags behind, by the same everywhere.
    const auto figures = figuresOfPairs(
        16000, [](double seconds) { return static_cast<std::int64_t>(8 * seconds); });
    EXPECT_EQ(valueOf(figures.whole.mtie, 0.125), 1);
    EXPECT_EQ(valueOf(figures.whole.mtie, 1000), 8000);
    EXPECT_NEAR(valueOf(figures.low.mtie, 1000), 8000, 0.1);
    EXPECT_EQ(valueOf(figures.whole.tdev, 512), 0);
    EXPECT_NEAR(valueOf(figures.low.tdev, 512), 0, 0.01);
    // The means of 0 to 999.875 s and of 1000 to 1999.875 s.
    ASSERT_TRUE(figures.constant);
    EXPECT_EQ(figures.constant->low, 3999.5);
    EXPECT_EQ(figures.constant->high, 11999.5);
    EXPECT_EQ(figures.constantError(), 11999.5);
    EXPECT_EQ(figures.mean, 7999.5);
}

TEST(TimeError, AtTheCutoffHalfThePowerIsOnEachSide) {
    const auto figures = figuresOfPairs(40000, [](double seconds) {
        return std::llround(10000 * std::sin(0.2 * 3.14159265358979 * seconds));
    });
    EXPECT_NEAR(figures.lowPassRange.value_or(0) / 20000, std::sqrt(0.5), 0.02);
    EXPECT_NEAR(figures.highPassRange.value_or(0) / 20000, std::sqrt(0.5), 0.04);
    EXPECT_NEAR(valueOf(figures.low.mtie, 1000), *figures.lowPassRange, 1);
    EXPECT_NEAR(valueOf(figures.whole.mtie, 1000), 20000, 20);
    EXPECT_NEAR(figures.rms, 10000 * std::sqrt(0.5), 1);
}

TEST(TimeError, AStepIsInMtieAtEachTauAndComesThroughTheFilterSlowly) {
    const auto figures =
        figuresOfPairs(20000, [](double seconds) { return seconds < 1200 ? -10 : 90; });
    for (const auto& each : figures.whole.mtie) {
        EXPECT_EQ(each.value, 100) << each.tau;
    }
    EXPECT_NEAR(valueOf(figures.low.mtie, 0.125),
                100 * (1 - std::exp(-0.2 * 3.14159265358979 * 0.125)), 1e-6);
    EXPECT_NEAR(valueOf(figures.low.mtie, 1000), 100, 1e-6);
    EXPECT_EQ(figures.constantError(), 70);
}

TEST(TimeError, NegativeAveragesMayBeTheFarthest) {
    const auto figures =
        figuresOfPairs(16000, [](double seconds) { return seconds < 1000 ? 10 : -30; });
    EXPECT_EQ(figures.averages, 2U);
    EXPECT_EQ(figures.constantError(), -30);
    EXPECT_EQ(figures.largest(), 30);
}

TEST(TimeError, OfLessThanThousandSecondsTheConstantPartIsTheMean) {
    const auto figures = figuresOfPairs(800, [](double) { return 5; });
    EXPECT_EQ(figures.averages, 0U);
    EXPECT_FALSE(figures.constant);
    EXPECT_EQ(figures.constantError(), 5);
}

TEST(TimeError, AfterAnInterruptionNothingIsComparedWithBefore) {
    PairSeries pairs;
    for (std::uint64_t i = 0; i < 2000; ++i) {
        if (i == 1000) {
            pairs.interrupt();
        }
        pairs.add({static_cast<double>(i) / 8, i * eighth, i < 1000 ? 0 : 5000, 0});
    }
    pairs.finish();
    const auto figures = figuresOf(pairs);
    EXPECT_EQ(valueOf(figures.whole.mtie, 64), 0);
    EXPECT_EQ(valueOf(figures.low.mtie, 64), 0);
    EXPECT_EQ(valueOf(figures.low.tdev, 32), 0);
    // The filter begins anew.
    EXPECT_EQ(figures.highPassRange, 0);
    EXPECT_EQ(figures.lowPassRange, 5000);
}

TEST(TimeError, AfterAVeryLongGapEverythingBeginsAnew) {
    TimeError error;
    const auto second = TimeError::longestGap + 100;
    for (const std::int64_t first : {std::int64_t{0}, second}) {
        for (std::int64_t i = 0; i < 100; ++i) {
            error.add({first + i, static_cast<double>(first)}, 0.125);
        }
    }
    EXPECT_EQ(error.wander(1).mtie.size(), 7U);
    EXPECT_EQ(error.wander(1).mtie.back().value, 0);
    // One slot less, and windows reach over it.
    error.add({second + 99 + TimeError::longestGap, 0}, 0.125);
    EXPECT_EQ(error.wander(1).mtie.back().tau, 1 << 17);
    EXPECT_EQ(error.wander(1).mtie.back().value, static_cast<double>(second));
}

TEST(TimeError, OfOnePairHasNothingOverTau) {
    const auto figures = figuresOfPairs(1, [](double) { return -7; });
    EXPECT_EQ(figures.interval, 0);
    EXPECT_EQ(figures.largest(), 7);
    EXPECT_EQ(figures.constantError(), -7);
    EXPECT_TRUE(figures.whole.mtie.empty());
    EXPECT_TRUE(figures.low.tdev.empty());
    EXPECT_FALSE(figures.lowPassRange);
}
