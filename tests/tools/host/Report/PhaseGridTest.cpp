#include "Report/PhaseGrid.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace {

class PhaseGridTest : public testing::Test {
protected:
    void add(const std::vector<std::uint64_t>& times) {
        for (const auto time : times) {
            grid.add(time, 0);
        }
        grid.flush();
    }

    std::vector<std::int64_t> slots() const {
        std::vector<std::int64_t> slots;
        for (const auto& sample : samples) {
            slots.push_back(sample.slot);
        }
        return slots;
    }

    std::vector<PhaseSample> samples;
    PhaseGrid grid{[this](const PhaseSample& sample) { samples.push_back(sample); }};
};

} // namespace

TEST_F(PhaseGridTest, IntervalIsTheMeanDistanceOfNeighbours) {
    grid.add(1000, 5);
    grid.add(2000, 6);
    grid.add(3010, 7);
    grid.add(4010, 9);
    grid.flush();
    EXPECT_NEAR(grid.interval(), 1003.3333333e-9, 1e-15);
    EXPECT_THAT(slots(), ElementsAre(0, 1, 2, 3));
    EXPECT_EQ(grid.missing(), 0);
    EXPECT_EQ(samples[0].phase, 0);
    EXPECT_EQ(samples[3].phase, 4);
}

TEST_F(PhaseGridTest, MissedSyncsLeaveSlotsEmptyAndDoNotCountForTheInterval) {
    add({0, 1000, 3000, 4000, 5000, 9000, 10000});
    EXPECT_NEAR(grid.interval(), 1000e-9, 1e-15);
    EXPECT_THAT(slots(), ElementsAre(0, 1, 3, 4, 5, 9, 10));
    EXPECT_EQ(grid.missing(), 4);
}

TEST_F(PhaseGridTest, UnevenDistancesDoNotAddUp) {
    // 4 % slow for 30 samples, then fast: each is a neighbour of the one before.
    std::vector<std::uint64_t> times{0};
    for (int i = 0; i < 60; ++i) {
        times.push_back(times.back() + (i < 30 ? 1040 : 960));
    }
    add(times);
    EXPECT_EQ(samples.back().slot, 60);
    EXPECT_EQ(grid.missing(), 0);
}

TEST_F(PhaseGridTest, AClockThatIsSetBackGoesToTheNextSlot) {
    add({5000, 6000, 2000, 3000});
    EXPECT_THAT(slots(), ElementsAre(0, 1, 2, 3));
}

TEST_F(PhaseGridTest, TimesAndOffsetsMayWrapAround) {
    grid.add(UINT64_MAX - 999, INT64_MAX);
    grid.add(0, INT64_MIN);
    grid.add(1000, INT64_MIN + 1);
    grid.flush();
    EXPECT_THAT(slots(), ElementsAre(0, 1, 2));
    EXPECT_EQ(samples[2].phase, 2);
}

TEST_F(PhaseGridTest, NeedsTwoTimesThatDiffer) {
    add({});
    add({1});
    EXPECT_TRUE(samples.empty());
    EXPECT_EQ(grid.interval(), 0);
    add({1, 1});
    EXPECT_TRUE(samples.empty());
}

TEST_F(PhaseGridTest, AfterAnInterruptionTheNextSlotBegins) {
    grid.add(0, 0);
    grid.add(1000, 0);
    grid.interrupt();
    grid.add(500000, 0);
    grid.add(501000, 0);
    grid.flush();
    EXPECT_THAT(slots(), ElementsAre(0, 1, 2, 3));
    EXPECT_TRUE(samples[0].begins);
    EXPECT_FALSE(samples[1].begins);
    EXPECT_TRUE(samples[2].begins);
    EXPECT_EQ(grid.missing(), 0);
    EXPECT_NEAR(grid.interval(), 1000e-9, 1e-15);
}

TEST_F(PhaseGridTest, ThousandsAreGivenBeforeTheEnd) {
    for (std::uint64_t i = 0; i < 5000; ++i) {
        grid.add(i * 1000 + i % 2, static_cast<std::int64_t>(i));
    }
    EXPECT_EQ(samples.size(), 5000U);
    EXPECT_EQ(samples.back().slot, 4999);
    EXPECT_EQ(samples.back().phase, 4999);
    EXPECT_NEAR(grid.interval(), 1000e-9, 1e-12);
}
