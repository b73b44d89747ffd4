#include "Report/Mtie.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Report/PublishedSets.h"

using namespace vantelhost;

namespace {

constexpr double circle = 6.28318530717958647693;

/// Of one sample a second, without gaps.
std::vector<TauValue> mtieOf(const std::vector<double>& phases, std::int64_t extra = 0) {
    Mtie mtie(extra);
    for (std::size_t i = 0; i < phases.size(); ++i) {
        mtie.add({static_cast<std::int64_t>(i), phases[i]});
    }
    return mtie.values(1);
}

/// The definition, with all windows.
double definedMtie(const std::vector<double>& phases, std::size_t steps) {
    double largest = 0;
    for (std::size_t i = 0; i + steps < phases.size(); ++i) {
        const auto first = phases.begin() + static_cast<std::ptrdiff_t>(i);
        const auto [low, high] =
            std::minmax_element(first, first + static_cast<std::ptrdiff_t>(steps) + 1);
        largest = std::max(largest, *high - *low);
    }
    return largest;
}

} // namespace

TEST(Mtie, OfFiveKnownPhases) {
    // By one step 4 at most (1 to 5); by two 5 (0, 1, 5); by four 7.
    const auto values = mtieOf({0, 1, 5, 4, 7});
    ASSERT_EQ(values.size(), 3U);
    EXPECT_EQ(values[0].tau, 1);
    EXPECT_EQ(values[0].value, 4);
    EXPECT_EQ(values[0].terms, 4U);
    EXPECT_EQ(values[1].tau, 2);
    EXPECT_EQ(values[1].value, 5);
    EXPECT_EQ(values[1].terms, 3U);
    EXPECT_EQ(values[2].tau, 4);
    EXPECT_EQ(values[2].value, 7);
    EXPECT_EQ(values[2].terms, 1U);
}

TEST(Mtie, IsThatOfAllWindows) {
    auto phases = thousandPhases();
    for (std::size_t i = 0; i < phases.size(); ++i) {
        phases[i] -= 0.5 * static_cast<double>(i);
    }
    for (const std::int64_t extra : {3, 5, 6, 7, 100, 255, 257, 1000}) {
        const auto values = mtieOf(phases, extra);
        ASSERT_EQ(values.size(), 11U) << extra;
        EXPECT_TRUE(std::any_of(values.begin(), values.end(), [&](const TauValue& each) {
            return each.tau == static_cast<double>(extra);
        })) << extra;
        for (const auto& [tau, value, terms] : values) {
            const auto steps = static_cast<std::size_t>(tau);
            EXPECT_EQ(value, definedMtie(phases, steps)) << tau;
            EXPECT_EQ(terms, phases.size() - steps) << tau;
        }
    }
}

TEST(Mtie, AFurtherTauThatIsThereAlreadyIsThereOnce) {
    EXPECT_EQ(mtieOf(thousandPhases(), 64).size(), 10U);
}

TEST(Mtie, OfAFrequencyOffsetIsThatTimesTau) {
    std::vector<double> phases;
    for (int i = 0; i < 5000; ++i) {
        phases.push_back(-0.25 * i);
    }
    const auto values = mtieOf(phases, 1000);
    ASSERT_EQ(values.size(), 14U);
    for (const auto& each : values) {
        EXPECT_EQ(each.value, 0.25 * each.tau);
    }
}

TEST(Mtie, OfAStepIsTheStepForEachTau) {
    std::vector<double> phases(3000, 5);
    std::fill(phases.begin() + 1717, phases.end(), -38);
    const auto values = mtieOf(phases);
    ASSERT_EQ(values.size(), 12U);
    for (const auto& each : values) {
        EXPECT_EQ(each.value, 43);
    }
}

TEST(Mtie, OfASineGrowsUntilHalfAPeriodAndNotBeyond) {
    std::vector<double> phases;
    for (int i = 0; i < 8192; ++i) {
        phases.push_back(50 * std::sin(circle * i / 1024));
    }
    const auto values = mtieOf(phases);
    ASSERT_EQ(values.size(), 13U);
    for (const auto& each : values) {
        const double expected = each.tau < 512 ? 100 * std::sin(circle * each.tau / 2048) : 100;
        EXPECT_NEAR(each.value / expected, 1, 1e-5) << each.tau;
    }
}

TEST(Mtie, InMissingPlacesNothingChanges) {
    Mtie mtie;
    mtie.add({0, 0});
    mtie.add({1, 10});
    mtie.add({5, 90});
    mtie.add({6, 70});
    const auto values = mtie.values(0.5);
    ASSERT_EQ(values.size(), 3U);
    // 0 to 10 or 90 to 70; then the same; then from 1 to 5.
    EXPECT_EQ(values[0].value, 20);
    EXPECT_EQ(values[1].value, 20);
    EXPECT_EQ(values[2].tau, 2);
    EXPECT_EQ(values[2].value, 80);
}

TEST(Mtie, NoWindowReachesOverABeginning) {
    Mtie mtie;
    for (int i = 0; i < 20; ++i) {
        mtie.add({i, i < 9 ? 1.0 * i : 1e9 - i, i == 9});
    }
    const auto values = mtie.values(1);
    ASSERT_EQ(values.size(), 4U);
    EXPECT_EQ(values[3].tau, 8);
    EXPECT_EQ(values[3].value, 8);
    EXPECT_EQ(values[3].terms, 4U);
}

TEST(Mtie, OfTooLittleIsNotThere) {
    EXPECT_TRUE(mtieOf({}).empty());
    EXPECT_TRUE(mtieOf({1}).empty());
    EXPECT_EQ(mtieOf({1, 1}).size(), 1U);
}

TEST(Mtie, ManyPlacesAreLookedAtInLongTimes) {
    // Up, and down again in the last quarter.
    constexpr int count = 1 << 20;
    Mtie mtie;
    for (int i = 0; i < count; ++i) {
        mtie.add({i, static_cast<double>(std::min(i, 3 * (count - i)))});
    }
    const auto values = mtie.values(1);
    ASSERT_EQ(values.size(), 21U);
    EXPECT_EQ(values[17].value, 3 << 17);
    EXPECT_EQ(values[17].terms, static_cast<std::uint64_t>(count - (1 << 17)));
    EXPECT_EQ(values[18].tau, 1 << 18);
    EXPECT_NEAR(values[18].value / (3 << 18), 1, 1e-5);
    EXPECT_NEAR(values[20].value / (3 << 18), 1, 1e-5);
    EXPECT_EQ(values[20].terms, 1U);
}
