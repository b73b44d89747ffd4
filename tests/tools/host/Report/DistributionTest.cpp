#include "Report/Distribution.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

TEST(Distribution, OfAStretchIsItsPercentiles) {
    std::vector<Point> points;
    for (int i = 0; i < 100; ++i) {
        // 1 to 100, and then 101 to 200, in another order
        points.push_back({static_cast<double>(i), static_cast<double>(i * 37 % 100 + 1)});
    }
    for (int i = 0; i < 101; ++i) {
        points.push_back({100.0 + i, 101.0 + i * 37 % 101});
    }
    const auto stretches = distribution(points, 2);
    ASSERT_EQ(stretches.size(), 2U);
    EXPECT_EQ(stretches[0].begin, 0);
    EXPECT_EQ(stretches[0].end, 100);
    EXPECT_EQ(stretches[1].end, 200);
    EXPECT_THAT(stretches[0].values, ElementsAre(1, 1, 25, 50, 75, 99, 100));
    EXPECT_THAT(stretches[1].values, ElementsAre(101, 102, 126, 151, 176, 200, 201));
}

TEST(Distribution, AStretchWithoutAPointIsLeftOut) {
    const auto stretches = distribution({{0, 1}, {1, 2}, {8, 4}, {9, 3}}, 3);
    ASSERT_EQ(stretches.size(), 2U);
    EXPECT_EQ(stretches[0].end, 3);
    EXPECT_EQ(stretches[1].begin, 6);
    EXPECT_THAT(stretches[1].values, ElementsAre(3, 3, 3, 3, 4, 4, 4));
}

TEST(Distribution, ASpikeOfOnePointStays) {
    std::vector<Point> points;
    for (int i = 0; i < 100000; ++i) {
        points.push_back({static_cast<double>(i), i == 77777 ? 9.0 : 1.0});
    }
    const auto stretches = distribution(points, 100);
    ASSERT_EQ(stretches.size(), 100U);
    EXPECT_THAT(stretches[77].values, ElementsAre(1, 1, 1, 1, 1, 1, 9));
    EXPECT_THAT(stretches[78].values, ElementsAre(1, 1, 1, 1, 1, 1, 1));
}

TEST(Distribution, AllAtOneMomentIsOneStretch) {
    const auto stretches = distribution({{1, 1}, {1, 2}, {1, 3}}, 5);
    ASSERT_EQ(stretches.size(), 1U);
    EXPECT_THAT(stretches[0].values, ElementsAre(1, 1, 1, 2, 3, 3, 3));
}
