#include "Report/ValueCounts.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace vantelhost {

static bool operator==(const ValueCounts::Row& a, const ValueCounts::Row& b) {
    return a.value == b.value && a.count == b.count;
}

} // namespace vantelhost

namespace {

ValueCounts counted(std::size_t most, const std::vector<std::int64_t>& list) {
    ValueCounts values(most);
    for (const auto value : list) {
        values.add(value);
    }
    return values;
}

} // namespace

TEST(ValueCounts, FewAreExactAndAscend) {
    using Row = ValueCounts::Row;
    const auto values = counted(4, {7, -3, 7, 7, 100});
    EXPECT_THAT(values.rows(), ElementsAre(Row{-3, 1}, Row{7, 3}, Row{100, 1}));
    EXPECT_EQ(values.size(), 5U);
    EXPECT_EQ(values.at(0), -3);
    EXPECT_EQ(values.at(1), 7);
    EXPECT_EQ(values.at(3), 7);
    EXPECT_EQ(values.at(4), 100);
}

TEST(ValueCounts, TooManyAreCountedInStepsOfAPowerOfTwo) {
    using Row = ValueCounts::Row;
    // Steps of 4 begin at -4, 0, 4 and 8; the ends stay exact.
    const auto values = counted(4, {-1, 0, 1, 2, 3, 4, 5, 6, 7, 8});
    EXPECT_THAT(values.rows(), ElementsAre(Row{-1, 1}, Row{2, 4}, Row{6, 4}, Row{8, 1}));
    EXPECT_EQ(values.smallest(), -1);
    EXPECT_EQ(values.largest(), 8);
    EXPECT_EQ(values.at(9), 8);
}

TEST(ValueCounts, ASpikeDoesNotMakeTheOthersCoarse) {
    const auto values = counted(4, {1000, 1001, 1002, INT64_MAX, 1001});
    EXPECT_EQ(values.at(1), 1001);
    EXPECT_EQ(values.at(3), 1002);
}

TEST(ValueCounts, TheWholeRangeFits) {
    const auto values =
        counted(4, {INT64_MIN, INT64_MIN / 2, INT64_MIN / 4, 0, 1, INT64_MAX / 2, INT64_MAX});
    EXPECT_EQ(values.size(), 7U);
    EXPECT_LE(values.rows().size(), 4U);
    EXPECT_EQ(values.at(0), INT64_MIN);
    EXPECT_EQ(values.at(6), INT64_MAX);
}

TEST(ValueCounts, OthersAreAddedAsCoarseAsTheCoarserIs) {
    using Row = ValueCounts::Row;
    auto values = counted(4, {1, 2});
    values.add(counted(4, {0, 1, 2, 3, 4, 5, 6, 7, 8}));
    EXPECT_THAT(values.rows(), ElementsAre(Row{2, 6}, Row{6, 4}, Row{8, 1}));
    values.add(ValueCounts(4));
    EXPECT_EQ(values.size(), 11U);
}

TEST(ValueCounts, NoneAddedToNoneAreNone) {
    ValueCounts values;
    values.add(ValueCounts());
    EXPECT_EQ(values.size(), 0U);
    EXPECT_TRUE(values.rows().empty());
}
