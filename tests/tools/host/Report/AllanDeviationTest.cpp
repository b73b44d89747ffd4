#include "Report/AllanDeviation.h"

#include <cmath>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace {

constexpr std::uint64_t second = 1000000000;

std::vector<std::int64_t> slotsOf(const PhaseSeries& series) {
    std::vector<std::int64_t> slots;
    for (const auto& sample : series.samples) {
        slots.push_back(sample.slot);
    }
    return slots;
}

/// One sample a second, without gaps.
PhaseSeries everySecond(const std::vector<double>& phases) {
    PhaseSeries series;
    series.interval = 1;
    for (const auto phase : phases) {
        series.samples.push_back({static_cast<std::int64_t>(series.samples.size()), phase});
    }
    return series;
}

} // namespace

TEST(PhaseGrid, IntervalIsTheMeanDistanceOfNeighbours) {
    const auto series = onGrid({1000, 2000, 3010, 4010}, {5, 6, 7, 9});
    EXPECT_NEAR(series.interval, 1003.3333333e-9, 1e-15);
    EXPECT_THAT(slotsOf(series), ElementsAre(0, 1, 2, 3));
    EXPECT_EQ(series.missing, 0);
    EXPECT_EQ(series.samples[3].phase - series.samples[0].phase, 4);
}

TEST(PhaseGrid, MissedSyncsLeaveSlotsEmptyAndDoNotCountForTheInterval) {
    const auto series = onGrid({0, 1000, 3000, 4000, 5000, 9000, 10000}, {1, 2, 3, 4, 5, 6, 7});
    EXPECT_NEAR(series.interval, 1000e-9, 1e-15);
    EXPECT_THAT(slotsOf(series), ElementsAre(0, 1, 3, 4, 5, 9, 10));
    EXPECT_EQ(series.missing, 4);
}

TEST(PhaseGrid, UnevenDistancesDoNotAddUp) {
    // 4 % slow for 30 samples, then fast: each is a neighbour of the one before.
    std::vector<std::uint64_t> times{0};
    for (int i = 0; i < 60; ++i) {
        times.push_back(times.back() + (i < 30 ? 1040 : 960));
    }
    const auto series = onGrid(times, std::vector<std::int64_t>(times.size()));
    EXPECT_EQ(series.samples.back().slot, 60);
    EXPECT_EQ(series.missing, 0);
}

TEST(PhaseGrid, AClockThatIsSetBackGoesToTheNextSlot) {
    const auto series = onGrid({5000, 6000, 2000, 3000}, {0, 0, 0, 0});
    EXPECT_THAT(slotsOf(series), ElementsAre(0, 1, 2, 3));
}

TEST(PhaseGrid, TimesAndOffsetsMayWrapAround) {
    const auto series = onGrid({UINT64_MAX - 999, 0, 1000}, {INT64_MAX, INT64_MIN, INT64_MIN + 1});
    EXPECT_THAT(slotsOf(series), ElementsAre(0, 1, 2));
    EXPECT_EQ(series.samples[2].phase, 2);
}

TEST(PhaseGrid, NeedsTwoTimesThatDiffer) {
    EXPECT_TRUE(onGrid({}, {}).samples.empty());
    EXPECT_TRUE(onGrid({1}, {1}).samples.empty());
    EXPECT_TRUE(onGrid({1, 1}, {1, 2}).samples.empty());
}

TEST(AllanDeviation, OfASquareGrowsWithTheRootOfTwoTimesTheSteps) {
    // The second difference of i^2 over m steps is 2 m^2, everywhere.
    std::vector<double> phases;
    for (int i = 0; i < 17; ++i) {
        phases.push_back(i * i);
    }
    const auto deviations = allanDeviations(everySecond(phases));
    ASSERT_EQ(deviations.size(), 3U);
    EXPECT_EQ(deviations[0].tau, 1);
    EXPECT_NEAR(deviations[0].value, 1.41421356e-9, 1e-16);
    EXPECT_EQ(deviations[0].terms, 15U);
    EXPECT_EQ(deviations[1].tau, 2);
    EXPECT_NEAR(deviations[1].value, 2.82842712e-9, 1e-16);
    EXPECT_EQ(deviations[1].terms, 13U);
    EXPECT_EQ(deviations[2].tau, 4);
    EXPECT_NEAR(deviations[2].value, 5.65685425e-9, 1e-16);
    EXPECT_EQ(deviations[2].terms, 9U);
}

TEST(AllanDeviation, OfFiveKnownPhases) {
    // Second differences 3, -5, 4: the mean of the squares is 50 / 3, its half 25 / 3.
    const auto deviations = allanDeviations(everySecond({0, 1, 5, 4, 7}));
    ASSERT_EQ(deviations.size(), 1U);
    EXPECT_NEAR(deviations[0].value, 2.88675135e-9, 1e-16);
}

TEST(AllanDeviation, OfAConstantFrequencyIsNothing) {
    const auto deviations = allanDeviations(everySecond({0, 3, 6, 9, 12, 15, 18, 21}));
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_EQ(deviations[0].value, 0);
    EXPECT_EQ(deviations[1].value, 0);
}

TEST(AllanDeviation, LeavesOutWhatNeedsAMissingSample) {
    // Slot 4 is missing: of 0 to 8 the differences that begin at 2, 3 and 4 for one step.
    auto series = everySecond({0, 1, 4, 9, 99, 25, 36, 49, 64});
    series.samples.erase(series.samples.begin() + 4);
    const auto deviations = allanDeviations(series);
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_EQ(deviations[0].terms, 4U);
    EXPECT_NEAR(deviations[0].value, 1.41421356e-9, 1e-16);
    // Two steps: 0, 2 and 4 need it.
    EXPECT_EQ(deviations[1].terms, 2U);
    EXPECT_NEAR(deviations[1].value, 2.82842712e-9, 1e-16);
}

TEST(AllanDeviation, IntervalComesFromTheGrid) {
    std::vector<std::uint64_t> times;
    std::vector<std::int64_t> offsets;
    for (int i = 0; i < 9; ++i) {
        times.push_back(7 * second + static_cast<std::uint64_t>(i) * second / 8);
        offsets.push_back(-917 + i * i);
    }
    const auto deviations = allanDeviations(onGrid(times, offsets));
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_NEAR(deviations[0].tau, 0.125, 1e-12);
    EXPECT_NEAR(deviations[0].value, 11.3137085e-9, 1e-15);
}

TEST(AllanDeviation, OfTooLittleIsNotThere) {
    EXPECT_TRUE(allanDeviations({}).empty());
    EXPECT_TRUE(allanDeviations(everySecond({1, 2, 3})).empty());
}
