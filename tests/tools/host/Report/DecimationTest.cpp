#include "Report/Decimation.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace vantelhost {

static bool operator==(const Point& a, const Point& b) {
    return a.x == b.x && a.y == b.y;
}

} // namespace vantelhost

using namespace vantelhost;
using testing::ElementsAre;

TEST(Decimation, FewPointsStayAsTheyAre) {
    EXPECT_TRUE(decimate({}, 2).empty());
    EXPECT_THAT(decimate({{0, 1}, {1, 5}, {2, 3}, {3, 0}}, 2),
                ElementsAre(Point{0, 1}, Point{1, 5}, Point{2, 3}, Point{3, 0}));
}

TEST(Decimation, KeepsTheLowestAndTheHighestOfEachBinInTheirOrder) {
    EXPECT_THAT(decimate({{0, 1}, {1, 5}, {2, 3}, {3, 0}, {4, 7}, {5, 2}, {6, 3}, {8, 4}}, 2),
                ElementsAre(Point{1, 5}, Point{3, 0}, Point{4, 7}, Point{5, 2}));
}

TEST(Decimation, ASpikeOfOnePointStays) {
    std::vector<Point> points;
    for (int i = 0; i < 100000; ++i) {
        points.push_back({static_cast<double>(i), i == 77777 ? 9.0 : 1.0});
    }
    const auto few = decimate(points, 100);
    EXPECT_LE(few.size(), 200U);
    EXPECT_THAT(few, testing::Contains(Point{77777, 9}));
}

TEST(Decimation, EmptyBinsAreLeftOut) {
    EXPECT_THAT(decimate({{0, 1}, {0, 2}, {0, 3}, {9, 4}, {9, 5}, {9, 6}, {9, 7}}, 3),
                ElementsAre(Point{0, 1}, Point{0, 3}, Point{9, 4}, Point{9, 7}));
}

TEST(Decimation, AllAtOneMomentAreTwo) {
    EXPECT_THAT(decimate({{1, 1}, {1, 2}, {1, 3}, {1, 0}, {1, 2}}, 2),
                ElementsAre(Point{1, 3}, Point{1, 0}));
}
