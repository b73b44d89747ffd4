#include "PairTrust.h"

#include <gtest/gtest.h>

using namespace vantelhost;

namespace {

constexpr std::uint64_t begin = 1795261620000000000;
constexpr std::int64_t oneMs = 1000000;
constexpr std::int64_t oneSecond = 1000 * oneMs;

/// A session with eight pairs a second.
class PairTrustTest : public testing::Test {
protected:
    void grandmasterComes() { trust.quality("usable", "PTP role has changed."); }
    void grandmasterGoes() { trust.quality("unusable", "PTP role has changed."); }

    PairKind pair(std::int64_t offset) {
        const std::uint64_t passed = ++count * 125 * oneMs;
        return trust.pair(begin + passed, offset,
                          {static_cast<double>(passed) * 1e-9,
                           begin + passed + static_cast<std::uint64_t>(stepped)});
    }

    /// Ten good ones.
    void lock() {
        for (int i = 1; i <= 10; ++i) {
            EXPECT_EQ(pair(100 + i), PairKind::measured) << i;
        }
    }

    PairTrust trust;
    std::uint64_t count = 0;
    std::int64_t stepped = 0; ///< the host's clock against the monotonic one, nanoseconds
};

} // namespace

TEST_F(PairTrustTest, WhatIsNoMeasurementIsToldAsSuch) {
    grandmasterComes();
    EXPECT_EQ(pair(0), PairKind::falseOffset);
    EXPECT_EQ(pair(250), PairKind::measured);
    grandmasterGoes();
    EXPECT_EQ(trust.pair(0, 250, {1, begin}), PairKind::of1970);
}

TEST_F(PairTrustTest, TheFirstGrandmasterIsBelievedAtOnce) {
    grandmasterComes();
    EXPECT_EQ(pair(250), PairKind::measured);
}

TEST_F(PairTrustTest, TheFirstTwoMeasurementsBehindAReturnAreLeftOut) {
    grandmasterComes();
    lock();
    grandmasterGoes();
    grandmasterComes();
    EXPECT_EQ(pair(110), PairKind::falseOffset);
    EXPECT_EQ(pair(250 * oneMs), PairKind::afterReturn);
    EXPECT_EQ(pair(400000), PairKind::afterReturn);
    EXPECT_EQ(pair(130), PairKind::measured);
    EXPECT_EQ(pair(131), PairKind::measured);
}

TEST_F(PairTrustTest, AFaultThatIsNoneOfTheGrandmasterIsNoReturn) {
    grandmasterComes();
    lock();
    trust.quality("unusable", "Unable to communicate with PTP sub process while attempting to "
                              "retrieve time data");
    EXPECT_EQ(pair(130), PairKind::measured);
}

TEST_F(PairTrustTest, AGrandmasterOfAnotherTimeIsFollowedWithTheNextPair) {
    grandmasterComes();
    lock();
    EXPECT_EQ(pair(80 * oneMs), PairKind::jump);
    EXPECT_EQ(pair(80 * oneMs + 5), PairKind::measured);
}

TEST_F(PairTrustTest, FromTheEighthOnEqualOffsetsAreLeftOut) {
    for (int i = 1; i <= 7; ++i) {
        EXPECT_EQ(pair(250), PairKind::measured) << i;
    }
    EXPECT_EQ(pair(250), PairKind::repeated);
    EXPECT_EQ(pair(250), PairKind::repeated);
    EXPECT_EQ(pair(251), PairKind::measured);
    EXPECT_EQ(pair(250), PairKind::measured);
}

TEST_F(PairTrustTest, ZerosBehindOtherOffsetsAreAsAnyEqualOnes) {
    lock();
    for (int i = 1; i <= 7; ++i) {
        EXPECT_EQ(pair(0), PairKind::measured) << i;
    }
    EXPECT_EQ(pair(0), PairKind::repeated);
}

TEST_F(PairTrustTest, AStepOfTheHostsClockLeavesTwoPairsOut) {
    lock();
    stepped = 5 * oneMs;
    EXPECT_EQ(pair(112), PairKind::jump);              // arrived before it
    EXPECT_EQ(pair(5 * oneMs + 2500), PairKind::jump); // measured across it
    EXPECT_EQ(pair(5 * oneMs + 113), PairKind::measured);
    EXPECT_EQ(pair(5 * oneMs + 114), PairKind::measured);
}

TEST_F(PairTrustTest, ALargeStepNeedsToBeConfirmedToo) {
    lock();
    stepped = -500 * oneMs;
    EXPECT_EQ(pair(112), PairKind::jump);
    EXPECT_EQ(pair(-750 * oneMs), PairKind::jump);
    EXPECT_EQ(pair(-500 * oneMs), PairKind::jump);
    EXPECT_EQ(pair(-500 * oneMs + 1), PairKind::measured);
}

TEST_F(PairTrustTest, AClockThatIsSlewedIsNotStepped) {
    lock();
    stepped = 900000; // of reading two clocks one after the other
    EXPECT_EQ(pair(112), PairKind::measured);
}

TEST_F(PairTrustTest, AnEpochOffsetIsNoJump) {
    lock();
    trust.epochOffset(37 * oneSecond);
    const std::uint64_t local = begin + ++count * 125 * oneMs + 37 * oneSecond;
    EXPECT_EQ(trust.pair(local, 37 * oneSecond + 120,
                         {static_cast<double>(count) * 0.125, begin + count * 125 * oneMs}),
              PairKind::measured);
}

/// The kernel sets its clock back at once, the grandmaster tells of the leap second when the
/// next Announce comes, or before the kernel knows. Reference and local time are both UTC's.
TEST_F(PairTrustTest, ALeapSecondInEitherOrderIsNeverBelievedAsAnOffset) {
    for (const bool kernelIsFirst : {true, false}) {
        trust = {};
        lock();
        const std::int64_t off = kernelIsFirst ? -oneSecond : oneSecond;
        stepped -= kernelIsFirst ? oneSecond : 0;
        for (int i = 1; i <= 40; ++i) {
            EXPECT_EQ(pair(off + i), PairKind::jump) << i;
        }
        stepped -= kernelIsFirst ? 0 : oneSecond;
        int leftOut = 0;
        while (pair(112 + leftOut) == PairKind::jump) {
            ++leftOut;
        }
        EXPECT_EQ(leftOut, kernelIsFirst ? 0 : 2);
    }
}
