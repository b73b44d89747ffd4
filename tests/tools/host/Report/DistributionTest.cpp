#include "Report/Distribution.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::Each;
using testing::ElementsAre;

TEST(Distribution, OfAStretchIsItsPercentiles) {
    Distribution distribution;
    for (int i = 0; i < 100; ++i) {
        // 1 to 100, and then 101 to 201, in another order
        distribution.add(i * 1e-6, i * 37 % 100 + 1);
    }
    for (int i = 0; i < 101; ++i) {
        distribution.add(0.001 + i * 1e-6, 101 + i * 37 % 101);
    }
    const auto stretches = distribution.stretches();
    ASSERT_EQ(stretches.size(), 2U);
    EXPECT_EQ(stretches[0].begin, 0);
    EXPECT_EQ(stretches[0].end, 1.0 / 1024);
    EXPECT_EQ(stretches[1].begin, 1.0 / 1024);
    EXPECT_EQ(stretches[1].end, 0.0011);
    EXPECT_THAT(stretches[0].values, ElementsAre(1, 1, 25, 50, 75, 99, 100));
    EXPECT_THAT(stretches[1].values, ElementsAre(101, 102, 126, 151, 176, 200, 201));
}

TEST(Distribution, AStretchWithoutAPointIsLeftOut) {
    Distribution distribution;
    distribution.add(100, 1);
    distribution.add(100, 2);
    distribution.add(100 + 3.0 / 1024, 5);
    const auto stretches = distribution.stretches();
    ASSERT_EQ(stretches.size(), 2U);
    EXPECT_EQ(stretches[0].end, 100 + 1.0 / 1024);
    EXPECT_EQ(stretches[1].begin, 100 + 3.0 / 1024);
}

TEST(Distribution, StretchesBecomeLongerAndStayFew) {
    Distribution distribution;
    for (int i = 0; i < 100000; ++i) {
        distribution.add(i, i == 77777 ? 9 : 1);
    }
    // 512 of 128 s would end at 65536 s.
    EXPECT_EQ(distribution.width(), 256);
    const auto stretches = distribution.stretches();
    ASSERT_EQ(stretches.size(), 391U);
    EXPECT_EQ(stretches[0].end, 256);
    EXPECT_EQ(stretches[390].end, 99999);
    for (std::size_t i = 0; i < stretches.size(); ++i) {
        EXPECT_EQ(stretches[i].values[6], i == 303 ? 9 : 1) << i;
        EXPECT_EQ(stretches[i].values[5], 1) << i;
    }
}

TEST(Distribution, APointAfterYearsIsStillOne) {
    Distribution distribution;
    distribution.add(0, 3);
    distribution.add(3e9, 4);
    const auto stretches = distribution.stretches();
    ASSERT_EQ(stretches.size(), 2U);
    EXPECT_THAT(stretches[0].values, Each(3));
    EXPECT_THAT(stretches[1].values, Each(4));
    EXPECT_EQ(stretches[1].end, 3e9);
}

TEST(Distribution, OfManyDifferentValuesIsExactToAThousandth) {
    Distribution distribution;
    for (int i = 0; i < 1000003; ++i) {
        distribution.add(1, static_cast<std::int64_t>(i) * 38197 % 1000003);
    }
    const auto values = distribution.stretches().at(0).values;
    EXPECT_EQ(values[0], 0);
    EXPECT_NEAR(values[1], 10000, 1000);
    EXPECT_NEAR(values[3], 500000, 1000);
    EXPECT_NEAR(values[5], 990000, 1000);
    EXPECT_EQ(values[6], 1000002);
}

TEST(Distribution, AllAtOneMomentIsOneStretch) {
    Distribution distribution;
    for (const auto value : {3, 1, 2}) {
        distribution.add(1, value);
    }
    const auto stretches = distribution.stretches();
    ASSERT_EQ(stretches.size(), 1U);
    EXPECT_THAT(stretches[0].values, ElementsAre(1, 1, 1, 2, 3, 3, 3));
}
