#include "OffsetLevel.h"

#include <gtest/gtest.h>

using namespace vantelhost;

namespace {

constexpr std::int64_t millisecond = 1000000;

/// Eight offsets a second.
class OffsetLevelTest : public testing::Test {
protected:
    bool take(std::int64_t offset) {
        seconds += 0.125;
        return level.take(seconds, offset);
    }

    /// Whether all are believed, that go on from one to another in equal steps.
    bool takeAll(std::int64_t offset, std::int64_t step, int count) {
        bool all = true;
        for (int i = 0; i < count; ++i) {
            all = take(offset + i * step) && all;
        }
        return all;
    }

    /// Takes the same offset until it is believed.
    /// @return for how many seconds it was not.
    double heldBack(std::int64_t offset) {
        const double begin = seconds;
        while (!take(offset) && seconds - begin < 1000) {
        }
        return seconds - begin;
    }

    OffsetLevel level;
    double seconds = 1795261620;
};

} // namespace

TEST_F(OffsetLevelTest, TheFirstIsBelievedWhateverItIs) {
    EXPECT_TRUE(take(37000 * millisecond));
}

TEST_F(OffsetLevelTest, OneThatIsFarOffIsNotBelieved) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    EXPECT_FALSE(take(250 * millisecond));
    EXPECT_TRUE(take(100));
    EXPECT_FALSE(take(-20 * millisecond));
    EXPECT_TRUE(take(100));
}

TEST_F(OffsetLevelTest, AJumpIsBelievedWithTheNextThatConfirmsIt) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    EXPECT_FALSE(take(50 * millisecond));
    EXPECT_TRUE(take(50 * millisecond + 10));
    EXPECT_TRUE(take(50 * millisecond + 20));
    EXPECT_FALSE(take(0));
}

TEST_F(OffsetLevelTest, AnOvershootBehindAStepIsNotBelieved) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    EXPECT_FALSE(take(75 * millisecond));
    EXPECT_FALSE(take(50 * millisecond));
    EXPECT_TRUE(take(50 * millisecond));
}

TEST_F(OffsetLevelTest, AStepThatIsKnownMakesTwoNotBelieved) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    level.distrust();
    EXPECT_FALSE(take(100));             // of before
    EXPECT_FALSE(take(7 * millisecond)); // measured across it
    EXPECT_TRUE(take(5 * millisecond));
}

TEST_F(OffsetLevelTest, AClockThatIsSlewedAsFastAsItCanIsBelieved) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    EXPECT_TRUE(takeAll(12 * millisecond, 12 * millisecond, 40));
}

TEST_F(OffsetLevelTest, WhatIsNearFollowsTheSpread) {
    EXPECT_TRUE(take(0));
    for (int i = 0; i < 50; ++i) {
        EXPECT_TRUE(take(i % 2 == 0 ? millisecond : 0));
    }
    EXPECT_TRUE(take(90 * millisecond)) << "a hundred times 1 millisecond";
    EXPECT_FALSE(take(5000 * millisecond));
}

TEST_F(OffsetLevelTest, OffsetsOfWhichNoneIsNearAnotherAreBelievedInTheEnd) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    int believed = 0;
    for (int i = 0; i < 32; ++i) {
        believed += take((i % 2 == 0 ? 300 : -300) * millisecond + i) ? 1 : 0;
    }
    EXPECT_EQ(believed, 32 - 7);
}

TEST_F(OffsetLevelTest, AJumpOfASecondIsBelievedWhenItHasLasted) {
    for (const std::int64_t jump : {1000 * millisecond, -1000 * millisecond, 990 * millisecond}) {
        level = {};
        EXPECT_TRUE(takeAll(0, 10, 10));
        EXPECT_DOUBLE_EQ(heldBack(jump), OffsetLevel::leapPatience + 0.125);
        EXPECT_TRUE(take(jump));
    }
}

TEST_F(OffsetLevelTest, AJumpOfAboutASecondIsNoLeapSecond) {
    for (const std::int64_t jump : {900 * millisecond, 1100 * millisecond, 2000 * millisecond}) {
        level = {};
        EXPECT_TRUE(takeAll(0, 10, 10));
        EXPECT_DOUBLE_EQ(heldBack(jump), 0.25);
    }
}

TEST_F(OffsetLevelTest, AJumpOfASecondThatEndsIsOverAtOnce) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    for (int i = 0; i < 29 * 8; ++i) {
        EXPECT_FALSE(take(-1000 * millisecond + i));
    }
    EXPECT_TRUE(take(200));
}

TEST_F(OffsetLevelTest, ASecondThatIsSlewedAwayIsNotBelievedOnTheWay) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    for (int i = 0; i < 90; ++i) {
        const std::int64_t offset = 1000 * millisecond - i * 10 * millisecond;
        EXPECT_EQ(take(offset), offset <= 101 * millisecond) << offset;
    }
    EXPECT_TRUE(take(101 * millisecond));
    EXPECT_TRUE(take(91 * millisecond));
}

TEST_F(OffsetLevelTest, ALeapSecondDuringAnOutageIsHeldBackToo) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    seconds += 3600;
    EXPECT_FALSE(take(1000 * millisecond));
    EXPECT_FALSE(take(1000 * millisecond));
    EXPECT_TRUE(take(3 * millisecond)) << "what a clock drifts";
}

TEST_F(OffsetLevelTest, AClockThatIsSetBackByHoursIsFollowed) {
    EXPECT_TRUE(takeAll(0, 10, 10));
    seconds -= 7200;
    EXPECT_FALSE(take(-7200000 * millisecond));
    EXPECT_TRUE(take(-7200000 * millisecond));
}

TEST_F(OffsetLevelTest, ExtremeOffsetsAreCompared) {
    EXPECT_TRUE(take(INT64_MIN));
    EXPECT_FALSE(take(INT64_MAX));
    EXPECT_TRUE(take(INT64_MAX));
    EXPECT_TRUE(take(INT64_MAX - 10));
}
