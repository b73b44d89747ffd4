#include "Report/Statistics.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace {

ValueCounts valuesOf(const std::vector<std::int64_t>& list) {
    ValueCounts values;
    for (const auto value : list) {
        values.add(value);
    }
    return values;
}

/// From first to last.
ValueCounts range(std::int64_t first, std::int64_t last) {
    ValueCounts values;
    for (auto value = first; value <= last; ++value) {
        values.add(value);
    }
    return values;
}

void add(ValueCounts& values, int count, std::int64_t value) {
    for (int i = 0; i < count; ++i) {
        values.add(value);
    }
}

} // namespace

TEST(Percentile, IsTheSmallestValueThatSoManyDoNotExceed) {
    const auto values = valuesOf({50, 15, 40, 20, 35});
    EXPECT_EQ(percentile(values, 0), 15);
    EXPECT_EQ(percentile(values, 50), 15);
    EXPECT_EQ(percentile(values, 200), 15);
    EXPECT_EQ(percentile(values, 300), 20);
    EXPECT_EQ(percentile(values, 400), 20);
    EXPECT_EQ(percentile(values, 401), 35);
    EXPECT_EQ(percentile(values, 500), 35);
    EXPECT_EQ(percentile(values, 1000), 50);
}

TEST(Percentile, OfHundredValuesIsTheirNumber) {
    const auto values = range(1, 100);
    EXPECT_EQ(percentile(values, 10), 1);
    EXPECT_EQ(percentile(values, 950), 95);
    EXPECT_EQ(percentile(values, 990), 99);
}

TEST(Percentile, OfMillionsOfValuesNeedsMoreThan32Bits) {
    ValueCounts values;
    add(values, 4299999, 0);
    values.add(1);
    EXPECT_EQ(percentile(values, 999), 0);
    EXPECT_EQ(percentile(values, 1000), 1);
}

TEST(Bulk, ASpikeOfThreeValuesDoesNotCount) {
    auto values = range(0, 399);
    values.add(valuesOf({5000000, 6000000, 7000000}));
    const auto bulkOf = bulk(values);
    EXPECT_EQ(bulkOf.low, 0);
    EXPECT_EQ(bulkOf.high, 498);
}

TEST(Bulk, IsAQuarterWiderThanTheThousandthPartsAtTheEnds) {
    auto values = range(-100000, 100000);
    add(values, 100, -1000000000);
    add(values, 100, 1000000000);
    const auto bulkOf = bulk(values);
    EXPECT_EQ(bulkOf.low, -149850);
    EXPECT_EQ(bulkOf.high, 149850);
}

TEST(Bulk, ReachesNoFurtherThanTheValues) {
    const auto bulkOf = bulk(range(-7, 92));
    EXPECT_EQ(bulkOf.low, -7);
    EXPECT_EQ(bulkOf.high, 92);
}

TEST(Bulk, OfFewValuesIsAll) {
    const auto bulkOf = bulk(valuesOf({1, 2, 3, 4, 5, 6, 7, 8, 1000000}));
    EXPECT_EQ(bulkOf.low, 1);
    EXPECT_EQ(bulkOf.high, 1000000);
}

TEST(Bulk, OfEqualValuesAndASpikeIsWhatIsEqual) {
    ValueCounts values;
    add(values, 20, 250);
    values.add(1000000);
    const auto bulkOf = bulk(values);
    EXPECT_EQ(bulkOf.low, 250);
    EXPECT_EQ(bulkOf.high, 260);
}

TEST(Outliers, AreOutsideOfTheExtentNotAtItsEdge) {
    const auto [below, above] = outliers(valuesOf({1, 2, 2, 3, 9, 10, 11, 12}), {2, 10});
    EXPECT_EQ(below, 1U);
    EXPECT_EQ(above, 2U);
}

TEST(Base, IsTakenAwayWhereDigitsWouldNotTellValuesApart) {
    EXPECT_EQ(baseOf({-36999999839, -36999999662}), -36999999839);
    EXPECT_EQ(baseOf({124999990.5, 125000010}), 124999990);
    EXPECT_EQ(baseOf({124000000, 126000000}), 0);
    EXPECT_EQ(baseOf({-200, 300}), 0);
    EXPECT_EQ(baseOf({0, 0}), 0);
}

TEST(Histogram, CountsEveryValueOnce) {
    const auto result = histogram(valuesOf({-3, -1, 0, 0, 2, 5}), 9);
    EXPECT_EQ(result.low, -3);
    EXPECT_EQ(result.width, 1);
    EXPECT_THAT(result.counts, ElementsAre(1, 0, 1, 2, 0, 1, 0, 0, 1));
    EXPECT_EQ(result.below + result.above, 0U);
}

TEST(Histogram, HasBinsOfARoundWidthThatBeginAtAMultipleOfIt) {
    const auto result = histogram(range(-7, 92), 25);
    EXPECT_EQ(result.width, 5);
    EXPECT_EQ(result.low, -10);
    EXPECT_EQ(result.counts.size(), 21U);
    EXPECT_EQ(result.counts.front(), 2U);
    EXPECT_EQ(result.counts[1], 5U);
    EXPECT_EQ(result.counts.back(), 3U);
}

TEST(Histogram, FewValuesFarAwayAreOnlyCounted) {
    auto values = range(0, 999);
    values.add(valuesOf({2000000, -1000000, 3000000}));
    const auto result = histogram(values, 60);
    EXPECT_EQ(result.below, 1U);
    EXPECT_EQ(result.above, 2U);
    EXPECT_EQ(result.width, 50);
    EXPECT_EQ(result.low, -250);
}

TEST(Histogram, OfEqualValuesIsOneBin) {
    const auto result = histogram(valuesOf({7, 7, 7}), 60);
    EXPECT_EQ(result.low, 7);
    EXPECT_THAT(result.counts, ElementsAre(3));
}

TEST(Histogram, OfEqualValuesButOneIsOneBin) {
    ValueCounts values;
    add(values, 1000, 0);
    values.add(100);
    const auto result = histogram(values, 10);
    EXPECT_EQ(result.counts.front(), 1000U);
    EXPECT_EQ(result.above, 1U);
}

TEST(Histogram, TakesTheWholeRangeOfOffsets) {
    const auto result = histogram(valuesOf({INT64_MIN, 0, INT64_MAX}), 60);
    EXPECT_EQ(result.counts.front(), 1U);
    EXPECT_EQ(result.counts.back(), 1U);
    EXPECT_LE(result.counts.size(), 62U);
}
