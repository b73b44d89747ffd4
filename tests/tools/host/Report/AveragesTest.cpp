#include "Report/Averages.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;

namespace {

class AveragesTest : public testing::Test {
protected:
    void add(std::int64_t first, std::int64_t last, double phase, bool begins = false) {
        for (auto slot = first; slot <= last; ++slot) {
            averages.add({slot, phase, begins && slot == first});
        }
    }

    void expect(std::uint64_t count, double low, double high) const {
        EXPECT_EQ(averages.count(), count);
        ASSERT_TRUE(averages.extent());
        EXPECT_EQ(averages.extent()->low, low);
        EXPECT_EQ(averages.extent()->high, high);
    }

    Averages averages{4};
};

} // namespace

TEST_F(AveragesTest, EachStretchHasItsMean) {
    averages.add({0, 1});
    averages.add({1, 2});
    averages.add({2, 3});
    EXPECT_EQ(averages.count(), 0U);
    EXPECT_FALSE(averages.extent());
    averages.add({3, 6});
    expect(1, 3, 3);
    add(4, 7, -5);
    expect(2, -5, 3);
    add(8, 10, 100);
    expect(2, -5, 3);
}

TEST_F(AveragesTest, HalfOfAStretchIsEnough) {
    averages.add({0, 10});
    averages.add({3, 20});
    expect(1, 15, 15);
    averages.add({5, 7});
    averages.add({6, 8});
    add(9, 9, 100);
    expect(2, 7.5, 15);
}

TEST_F(AveragesTest, LessThanHalfIsNone) {
    averages.add({0, 10});
    averages.add({7, 20});
    averages.add({8, 30});
    EXPECT_EQ(averages.count(), 0U);
}

TEST_F(AveragesTest, StretchesBeginAtABeginning) {
    add(0, 2, 5);
    add(3, 6, 9, true);
    expect(1, 9, 9);
}

TEST_F(AveragesTest, StretchesStayWhereTheyAreOverAGap) {
    add(0, 3, 1);
    add(14, 15, 3);
    expect(2, 1, 3);
    add(16, 19, 2);
    expect(3, 1, 3);
}
