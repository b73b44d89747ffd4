#include "Report/LowPass.h"

#include <cmath>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;

TEST(LowPass, AStepComesThroughWithTheTimeConstant) {
    LowPass filter(0.1, 0.125);
    std::int64_t slot = 0;
    for (; slot < 200; ++slot) {
        filter.next({slot, 5});
    }
    for (int i = 1; i <= 100; ++i, ++slot) {
        const double expected = 5 + 100 * (1 - std::exp(-0.2 * 3.14159265358979 * i * 0.125));
        EXPECT_NEAR(filter.next({slot, 105}).value_or(0), expected, 1e-9);
    }
}

TEST(LowPass, HasToSettleForFiveTimeConstants) {
    // 7.96 s, which are 63.7 intervals.
    LowPass filter(0.1, 0.125);
    for (std::int64_t slot = 0; slot < 63; ++slot) {
        EXPECT_FALSE(filter.next({slot, 1})) << slot;
    }
    EXPECT_EQ(filter.next({63, 1}), 1);
    EXPECT_FALSE(filter.next({64, 7, true}));
}

TEST(LowPass, BeginsWithTheMean) {
    // Up to 14 samples the mean gives each more than the filter would.
    LowPass filter(1, 0.0118);
    std::optional<double> level;
    for (std::int64_t slot = 0; slot < 68; ++slot) {
        level = filter.next({slot, slot == 0 ? 1400.0 : 0});
    }
    ASSERT_TRUE(level);
    // A 14th of it, and 54 intervals of decay.
    EXPECT_NEAR(*level, 100 * std::exp(-2 * 3.14159265358979 * 54 * 0.0118), 0.1);
}

TEST(LowPass, StandsStillWhereSamplesAreMissing) {
    LowPass filter(0.1, 0.125);
    for (std::int64_t slot = 0; slot < 100; ++slot) {
        filter.next({slot, 0});
    }
    const double weight = 1 - std::exp(-0.2 * 3.14159265358979 * 0.125);
    EXPECT_NEAR(filter.next({500, 10}).value_or(0), 10 * weight, 1e-9);
}

TEST(LowPass, PassesAllOfSlowSamples) {
    LowPass filter(0.1, 60);
    EXPECT_EQ(filter.next({0, 3}), 3);
    EXPECT_NEAR(filter.next({1, 9}).value_or(0), 9, 1e-9);
}
