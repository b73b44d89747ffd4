#include "Report/AllanDeviation.h"

#include <cmath>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Report/PublishedSets.h"

using namespace vantelhost;

namespace {

constexpr std::uint64_t second = 1000000000;

/// Of one sample a second, without gaps.
std::vector<TauValue> everySecond(const std::vector<double>& phases) {
    AllanDeviation deviation;
    for (std::size_t i = 0; i < phases.size(); ++i) {
        deviation.add({static_cast<std::int64_t>(i), phases[i]});
    }
    return deviation.deviations(1);
}

/// Phases that a sum of sines has.
double wave(int i) {
    return 50 * std::sin(i * 0.01) + 7 * std::sin(i * 1.3) + i * 0.001;
}

/// The definition, with all second differences.
double definition(int samples, int steps) {
    double squares = 0;
    for (int i = 0; i + 2 * steps < samples; ++i) {
        const double difference = wave(i + 2 * steps) - 2 * wave(i + steps) + wave(i);
        squares += difference * difference;
    }
    return std::sqrt(squares / (2.0 * steps * steps * (samples - 2 * steps))) * 1e-9;
}

} // namespace

TEST(AllanDeviation, OfASquareGrowsWithTheRootOfTwoTimesTheSteps) {
    // The second difference of i^2 over m steps is 2 m^2, everywhere.
    std::vector<double> phases;
    for (int i = 0; i < 17; ++i) {
        phases.push_back(i * i);
    }
    const auto deviations = everySecond(phases);
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
    const auto deviations = everySecond({0, 1, 5, 4, 7});
    ASSERT_EQ(deviations.size(), 1U);
    EXPECT_NEAR(deviations[0].value, 2.88675135e-9, 1e-16);
}

TEST(AllanDeviation, OfThePublishedFrequencies) {
    const auto nine = everySecond(nbsPhases());
    ASSERT_EQ(nine.size(), 2U);
    EXPECT_NEAR(nine[0].value * 1e9, 91.22945, 5e-6);
    EXPECT_NEAR(nine[1].value * 1e9, 85.95287, 5e-6);
    const auto thousand = everySecond(thousandPhases());
    EXPECT_NEAR(thousand.at(0).value * 1e9, 2.922319e-01, 5e-8);
}

TEST(AllanDeviation, OfAConstantFrequencyIsNothing) {
    const auto deviations = everySecond({0, 3, 6, 9, 12, 15, 18, 21});
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_EQ(deviations[0].value, 0);
    EXPECT_EQ(deviations[1].value, 0);
}

TEST(AllanDeviation, LeavesOutWhatNeedsAMissingSample) {
    // Slot 4 is missing: of 0 to 8 the differences that begin at 2, 3 and 4 for one step.
    AllanDeviation deviation;
    for (const int i : {0, 1, 2, 3, 5, 6, 7, 8}) {
        deviation.add({i, static_cast<double>(i * i)});
    }
    const auto deviations = deviation.deviations(1);
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_EQ(deviations[0].terms, 4U);
    EXPECT_NEAR(deviations[0].value, 1.41421356e-9, 1e-16);
    // Two steps: 0, 2 and 4 need it.
    EXPECT_EQ(deviations[1].terms, 2U);
    EXPECT_NEAR(deviations[1].value, 2.82842712e-9, 1e-16);
}

TEST(AllanDeviation, IntervalComesFromTheGrid) {
    AllanDeviation deviation;
    PhaseGrid grid([&](const PhaseSample& sample) { deviation.add(sample); });
    for (int i = 0; i < 9; ++i) {
        grid.add(7 * second + static_cast<std::uint64_t>(i) * second / 8, -917 + i * i);
    }
    grid.flush();
    const auto deviations = deviation.deviations(grid.interval());
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_NEAR(deviations[0].tau, 0.125, 1e-12);
    EXPECT_NEAR(deviations[0].value, 11.3137085e-9, 1e-15);
}

TEST(AllanDeviation, OfTooLittleIsNotThere) {
    EXPECT_TRUE(everySecond({}).empty());
    EXPECT_TRUE(everySecond({1, 2, 3}).empty());
}

TEST(AllanDeviation, NothingIsComparedAcrossABeginning) {
    AllanDeviation deviation;
    for (int i = 0; i < 20; ++i) {
        // 0 to 9 are of another clock than 10 to 19.
        deviation.add({i, i < 10 ? i * i : 1e9 + i * i, i == 10});
    }
    const auto deviations = deviation.deviations(1);
    ASSERT_EQ(deviations.size(), 3U);
    EXPECT_EQ(deviations[0].terms, 16U);
    EXPECT_NEAR(deviations[0].value, 1.41421356e-9, 1e-16);
    EXPECT_EQ(deviations[2].terms, 4U);
    EXPECT_NEAR(deviations[2].value, 5.65685425e-9, 1e-16);
}

TEST(AllanDeviation, UpTo1024StepsIsThatOfAllSecondDifferences) {
    std::vector<double> phases;
    for (int i = 0; i < 20000; ++i) {
        phases.push_back(wave(i));
    }
    const auto deviations = everySecond(phases);
    ASSERT_EQ(deviations.size(), 13U);
    for (std::size_t octave = 0; octave <= 10; ++octave) {
        const int steps = 1 << octave;
        EXPECT_EQ(deviations[octave].terms, 20000U - 2U * static_cast<unsigned>(steps));
        EXPECT_NEAR(deviations[octave].value / definition(20000, steps), 1, 1e-9) << steps;
    }
}

TEST(AllanDeviation, BeyondThatThousandStartsInEachTimeAreAsGood) {
    std::vector<double> phases;
    for (int i = 0; i < 20000; ++i) {
        phases.push_back(wave(i));
    }
    const auto deviations = everySecond(phases);
    ASSERT_EQ(deviations.size(), 13U);
    // Each second slot, and each fourth one.
    EXPECT_EQ(deviations[11].terms, (20000U - 2 * 2048) / 2);
    EXPECT_EQ(deviations[12].terms, (20000U - 2 * 4096) / 4);
    EXPECT_NEAR(deviations[11].value / definition(20000, 2048), 1, 0.01);
    EXPECT_NEAR(deviations[12].value / definition(20000, 4096), 1, 0.01);
}
