#include "PairFilter.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;

namespace {

constexpr std::uint64_t now = 1795261620000000000;

/// A session whose pairs are a second apart.
class PairFilterTest : public testing::Test {
protected:
    void grandmasterComes() { filter.quality("usable", "PTP role has changed."); }
    void grandmasterGoes() { filter.quality("unusable", "PTP role has changed."); }

    PairKind pair(std::int64_t offset) {
        local += 1000000000;
        return filter.pair(local, offset);
    }

    PairFilter filter;
    std::uint64_t local = now;
};

} // namespace

TEST_F(PairFilterTest, ZerosAtTheStartAreFalseUntilTheFirstOtherOffset) {
    grandmasterComes();
    EXPECT_EQ(pair(0), PairKind::falseOffset);
    EXPECT_EQ(pair(0), PairKind::falseOffset);
    EXPECT_EQ(pair(-4999940), PairKind::measured);
    EXPECT_EQ(pair(0), PairKind::measured);
    EXPECT_EQ(pair(0), PairKind::measured);
    EXPECT_EQ(filter.counts().falseOffsets, 2U);
    EXPECT_EQ(filter.counts().measured, 3U);
    EXPECT_EQ(filter.counts().all(), 5U);
}

TEST_F(PairFilterTest, ZerosAtTheStartAreFalseBeforeAnyQuality) {
    EXPECT_EQ(pair(0), PairKind::falseOffset);
    EXPECT_EQ(pair(1), PairKind::measured);
}

TEST_F(PairFilterTest, TheLastOffsetIsFalseWhenAGrandmasterReturns) {
    grandmasterComes();
    pair(200);
    EXPECT_EQ(pair(250), PairKind::measured);
    grandmasterGoes();
    grandmasterComes();
    EXPECT_EQ(pair(250), PairKind::falseOffset);
    EXPECT_EQ(pair(250), PairKind::falseOffset);
    EXPECT_EQ(pair(251), PairKind::measured);
    EXPECT_EQ(pair(251), PairKind::measured);
}

TEST_F(PairFilterTest, AnotherOffsetIsMeasuredAtOnceWhenAGrandmasterReturns) {
    pair(250);
    grandmasterGoes();
    grandmasterComes();
    EXPECT_EQ(pair(0), PairKind::measured);
    EXPECT_EQ(pair(0), PairKind::measured);
}

TEST_F(PairFilterTest, ThePairWhenTheGrandmasterGoesIsOf1970) {
    grandmasterComes();
    pair(250);
    grandmasterGoes();
    EXPECT_EQ(filter.pair(0, 260), PairKind::of1970);
    EXPECT_EQ(filter.counts().of1970, 1U);
    EXPECT_EQ(filter.counts().measured, 1U);
    // Its offset is ptp4l's last one.
    grandmasterComes();
    EXPECT_EQ(pair(260), PairKind::falseOffset);
    EXPECT_EQ(pair(250), PairKind::measured);
}

TEST_F(PairFilterTest, AFaultThatIsNoneOfTheGrandmasterBeginsNothing) {
    grandmasterComes();
    pair(250);
    filter.quality("unusable", "Unable to communicate with PTP sub process while attempting to "
                               "retrieve time data");
    EXPECT_EQ(pair(250), PairKind::measured);
}

TEST_F(PairFilterTest, TheEpochOffsetIsTakenAway) {
    constexpr std::int64_t epochOffset = 37000000000;
    filter.epochOffset(epochOffset);
    EXPECT_EQ(pair(epochOffset), PairKind::falseOffset);
    EXPECT_EQ(pair(epochOffset + 250), PairKind::measured);
    EXPECT_EQ(filter.pair(epochOffset, epochOffset + 250), PairKind::of1970);
    grandmasterGoes();
    filter.epochOffset(-epochOffset);
    grandmasterComes();
    EXPECT_EQ(pair(-epochOffset + 250), PairKind::falseOffset);
    EXPECT_EQ(filter.pair(static_cast<std::uint64_t>(-epochOffset), 0), PairKind::of1970);
}

TEST_F(PairFilterTest, APairOf1970IsFoundWhereAnotherPartyWritesTheEpochOffset) {
    grandmasterComes();
    pair(37000000250);
    grandmasterGoes();
    EXPECT_EQ(filter.pair(37000000000, 37000000250), PairKind::of1970);
}

TEST_F(PairFilterTest, AClockThatIsSetBackIsMeasured) {
    grandmasterComes();
    pair(250);
    EXPECT_EQ(filter.pair(now - 5000000000, 251), PairKind::measured);
}

TEST_F(PairFilterTest, OnlyZerosAreToldApartFromNoPairsAtAll) {
    EXPECT_FALSE(filter.counts().onlyZeros());
    pair(0);
    grandmasterGoes();
    filter.pair(0, 0);
    grandmasterComes();
    pair(0);
    EXPECT_TRUE(filter.counts().onlyZeros());
    EXPECT_EQ(noDelayText(0, filter.counts().falseOffsets),
              "offset exactly 0 in 2 of 2 pairs: no delay is measured: delayMechanism?");
    pair(1);
    EXPECT_FALSE(filter.counts().onlyZeros());
}

TEST_F(PairFilterTest, ExtremeNumbersAreCompared) {
    filter.epochOffset(INT64_MIN);
    EXPECT_EQ(filter.pair(now, INT64_MIN), PairKind::falseOffset);
    EXPECT_EQ(filter.pair(now, INT64_MAX), PairKind::measured);
    EXPECT_EQ(filter.pair(std::uint64_t{1} << 63U, 0), PairKind::of1970);
}
