#include "OffsetWindow.h"

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(OffsetWindow, EmptyHasNothing) {
    const OffsetWindow window(60);
    EXPECT_EQ(window.statistics(0).count, 0U);
    EXPECT_EQ(window.rate(0), 0);
}

TEST(OffsetWindow, StatisticsAreExact) {
    OffsetWindow window(60);
    window.add(1, -3);
    window.add(2, 4);
    window.add(3, 12);
    const auto statistics = window.statistics(3);
    EXPECT_EQ(statistics.count, 3U);
    EXPECT_EQ(statistics.smallest, -3);
    EXPECT_EQ(statistics.largest, 12);
    EXPECT_DOUBLE_EQ(statistics.mean(), 13.0 / 3);
    EXPECT_DOUBLE_EQ(statistics.rms(), 7.505553499465135); // sqrt(169 / 3)
}

TEST(OffsetWindow, ExtremesLeaveWithTheirTime) {
    OffsetWindow window(60);
    window.add(0, 1000);
    window.add(1, -1000);
    window.add(50, 30);
    window.add(51, 40);
    EXPECT_EQ(window.statistics(60).largest, 1000); // just not too old
    EXPECT_EQ(window.statistics(60.5).largest, 40);
    EXPECT_EQ(window.statistics(60.5).smallest, -1000);
    EXPECT_EQ(window.statistics(61.5).smallest, 30);
    EXPECT_DOUBLE_EQ(window.statistics(61.5).rms(), 35.35533905932738); // sqrt(1250)
    EXPECT_EQ(window.statistics(111.5).count, 0U);
}

TEST(OffsetWindow, AddingDropsWhatIsTooOld) {
    OffsetWindow window(10);
    window.add(0, 5);
    window.add(20, 6);
    EXPECT_EQ(window.statistics(0).count, 1U); // asked for a time at which both were young enough
}

TEST(OffsetWindow, RateCountsIntervalsAndFallsWhenNothingComes) {
    OffsetWindow window(60);
    for (int i = 0; i <= 16; ++i) {
        window.add(10 + i * 0.125, 0);
    }
    EXPECT_DOUBLE_EQ(window.rate(12), 8);
    EXPECT_DOUBLE_EQ(window.rate(14), 4);
    EXPECT_DOUBLE_EQ(window.rate(80), 0);
}

TEST(OffsetWindow, OnePairIsNoRate) {
    OffsetWindow window(60);
    window.add(1, 0);
    EXPECT_EQ(window.rate(1), 0);
    EXPECT_EQ(window.rate(2), 0);
}
