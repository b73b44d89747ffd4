#include "Report/TimeDeviation.h"

#include <cmath>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Report/PublishedSets.h"

using namespace vantelhost;

namespace {

constexpr double halfCircle = 3.14159265358979323846;

/// Of one sample a second, without gaps.
std::vector<TauValue> timeDeviations(const std::vector<double>& phases) {
    TimeDeviation deviation;
    for (std::size_t i = 0; i < phases.size(); ++i) {
        deviation.add({static_cast<std::int64_t>(i), phases[i]});
    }
    return deviation.values(1);
}

/// The definition, of all sums: with n the steps and N the phases,
/// TDEV^2 = sum over j of (sum over n phases from j on of x[i+2n] - 2 x[i+n] + x[i])^2
///          / (6 n^2 (N - 3n + 1)).
double definedTdev(const std::vector<double>& phases, std::size_t steps) {
    double squares = 0;
    std::size_t terms = 0;
    for (std::size_t j = 0; j + 3 * steps <= phases.size(); ++j, ++terms) {
        double sum = 0;
        for (std::size_t i = j; i < j + steps; ++i) {
            sum += phases[i + 2 * steps] - 2 * phases[i + steps] + phases[i];
        }
        squares += sum * sum;
    }
    const auto n = static_cast<double>(steps);
    return std::sqrt(squares / (6 * n * n * static_cast<double>(terms)));
}

} // namespace

TEST(TimeDeviation, OfThePublishedNineFrequencies) {
    const auto deviations = timeDeviations(nbsPhases());
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_NEAR(deviations[0].value, 52.67135, 5e-6);
    EXPECT_NEAR(deviations[1].value, 86.35831, 5e-6);
}

TEST(TimeDeviation, OfThePublishedThousandFrequencies) {
    const auto phases = thousandPhases();
    // Published for 1, 10 and 100: the definition here is theirs.
    EXPECT_NEAR(definedTdev(phases, 1), 1.687202e-01, 5e-8);
    EXPECT_NEAR(definedTdev(phases, 10), 3.563623e-01, 5e-8);
    EXPECT_NEAR(definedTdev(phases, 100), 1.253382e+00, 5e-7);
    const auto deviations = timeDeviations(phases);
    ASSERT_EQ(deviations.size(), 9U);
    for (std::size_t octave = 0; octave < deviations.size(); ++octave) {
        const auto steps = std::size_t{1} << octave;
        EXPECT_EQ(deviations[octave].tau, static_cast<double>(steps));
        EXPECT_EQ(deviations[octave].terms, 1001 - 3 * steps + 1);
        EXPECT_NEAR(deviations[octave].value / definedTdev(phases, steps), 1, 1e-12) << steps;
    }
}

TEST(TimeDeviation, OfWhitePhaseFallsWithTheRootOfTau) {
    // Evenly from -1 to 1: a standard deviation of 1 / sqrt(3).
    std::vector<double> phases;
    for (std::uint64_t number = 1234567890; phases.size() < 100000;
         number = number * 16807 % 2147483647) {
        phases.push_back(static_cast<double>(number) / 1073741823.5 - 1);
    }
    const auto deviations = timeDeviations(phases);
    for (std::size_t octave = 0; octave <= 8; ++octave) {
        EXPECT_NEAR(deviations[octave].value * std::sqrt(3 * deviations[octave].tau), 1, 0.05);
    }
}

TEST(TimeDeviation, OfAConstantFrequencyIsNothing) {
    std::vector<double> phases;
    for (int i = 0; i < 24; ++i) {
        phases.push_back(1000 + 3 * i);
    }
    const auto deviations = timeDeviations(phases);
    ASSERT_EQ(deviations.size(), 4U);
    for (const auto& each : deviations) {
        EXPECT_EQ(each.value, 0) << each.tau;
    }
}

TEST(TimeDeviation, OfASineIsWhatTheMeansLeaveOfIt) {
    constexpr double frequency = 1.0 / 1024;
    std::vector<double> phases;
    for (int i = 0; i < 40 * 1024; ++i) {
        phases.push_back(100 * std::sin(2 * halfCircle * frequency * i));
    }
    const auto deviations = timeDeviations(phases);
    // A mean of n multiplies it by sin(pi f tau) / (n sin(pi f)), a second difference by
    // 4 sin^2(pi f tau); the mean square of a sine is a half.
    for (const std::size_t octave : {0U, 4U, 7U, 8U}) {
        const double tau = deviations[octave].tau;
        const double sine = std::sin(halfCircle * frequency * tau);
        const double expected =
            100 * 4 * sine * sine * sine / (tau * std::sin(halfCircle * frequency) * std::sqrt(12));
        EXPECT_NEAR(deviations[octave].value / expected, 1, 0.005) << tau;
    }
    // Means of whole periods.
    EXPECT_NEAR(deviations[10].value, 0, 1e-9);
}

TEST(TimeDeviation, AMeanIsThatOfTheSamplesThatAreThere) {
    // Of 0 to 8, slot 4 is missing. One step: those that end at 4, 5 and 6 need it; of the others
    // the second difference is 2.
    TimeDeviation deviation;
    for (const int i : {0, 1, 2, 3, 5, 6, 7, 8}) {
        deviation.add({i, static_cast<double>(i * i)});
    }
    const auto deviations = deviation.values(1);
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_EQ(deviations[0].terms, 4U);
    EXPECT_NEAR(deviations[0].value, std::sqrt(4.0 / 6), 1e-12);
    // Two steps: means of 0.5, 6.5, 25 (one alone); 2.5, 9, 30.5 without 4; 6.5, 25, 42.5;
    // 9, 30.5, 56.5.
    EXPECT_EQ(deviations[1].terms, 4U);
    const double squares = 12.5 * 12.5 + 15.0 * 15.0 + 1.0 + 4.5 * 4.5;
    EXPECT_NEAR(deviations[1].value, std::sqrt(squares / 4 / 6), 1e-12);
}

TEST(TimeDeviation, WhereMoreThanHalfIsMissingNothingIsSummed) {
    TimeDeviation deviation;
    for (int i = 0; i < 96; i += 3) {
        deviation.add({i, static_cast<double>(i % 7)});
    }
    // A third is there: some means have their half, but no three successive ones.
    EXPECT_TRUE(deviation.values(1).empty());
}

TEST(TimeDeviation, NothingIsComparedAcrossABeginning) {
    TimeDeviation deviation;
    for (int i = 0; i < 20; ++i) {
        deviation.add({i, i < 10 ? i * i : 1e9 + i * i, i == 10});
    }
    const auto deviations = deviation.values(1);
    ASSERT_EQ(deviations.size(), 2U);
    EXPECT_EQ(deviations[0].terms, 16U);
    EXPECT_NEAR(deviations[0].value, std::sqrt(4.0 / 6), 1e-6);
}

TEST(TimeDeviation, BeyondThousandStepsSumsBeginAtThousandPlacesOfEach) {
    std::vector<double> phases;
    for (int i = 0; i < 20000; ++i) {
        phases.push_back(50 * std::sin(i * 0.001) + 7 * std::sin(i * 1.3));
    }
    const auto deviations = timeDeviations(phases);
    ASSERT_EQ(deviations.size(), 13U);
    EXPECT_EQ(deviations[12].tau, 4096);
    EXPECT_EQ(deviations[12].terms, (20000U - 3 * 4096) / 4 + 1);
    EXPECT_NEAR(deviations[12].value / definedTdev(phases, 4096), 1, 0.01);
    EXPECT_NEAR(deviations[11].value / definedTdev(phases, 2048), 1, 0.01);
}
