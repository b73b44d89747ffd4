#include "Report/RecordAxis.h"

#include <stdexcept>

#include <gtest/gtest.h>

using namespace vantelhost;

namespace {

/// @param time seconds
Moment at(double seconds, double time) {
    return {seconds, static_cast<std::uint64_t>(time * 1e9)};
}

} // namespace

TEST(RecordAxis, BeginsWithTheHostOrWhereTheRecordDoes) {
    RecordAxis whole;
    whole.begin(at(3, 1003), true);
    EXPECT_EQ(whole.seconds(), 3);
    EXPECT_EQ(whole.origin(), 1000000000000U);
    RecordAxis rest;
    rest.begin(at(3, 1003), false);
    EXPECT_EQ(rest.seconds(), 0);
    EXPECT_EQ(rest.origin(), 1003000000000U);
}

TEST(RecordAxis, ARunFollowsAsFarAwayAsTheHostsClockSays) {
    RecordAxis axis;
    axis.begin(at(3, 1003), true);
    EXPECT_EQ(axis.begin(at(0.5, 1103), true), 100);
    EXPECT_EQ(axis.seconds(), 103);
    axis.follow(at(1.5, 1104));
    EXPECT_EQ(axis.seconds(), 104);
}

TEST(RecordAxis, NeverGoesBack) {
    RecordAxis axis;
    axis.begin(at(3, 1003), true);
    EXPECT_EQ(axis.begin(at(1, 3), true), -1000);
    EXPECT_EQ(axis.seconds(), 3);
    EXPECT_THROW(axis.follow(at(0.9, 3)), std::runtime_error);
    EXPECT_EQ(axis.seconds(), 3);
}

TEST(RecordAxis, WithinARunTheClockMayBeSet) {
    RecordAxis axis;
    axis.begin(at(1, 1001), true);
    EXPECT_EQ(axis.follow(at(2, 1002.5)), 0);
    EXPECT_EQ(axis.follow(at(3, 4603.5)), 3600);
    EXPECT_EQ(axis.follow(at(4, 1004.5)), -3600);
    EXPECT_EQ(axis.seconds(), 4);
}

TEST(RecordAxis, AMomentOfTheSameRunAgreesWithBothClocks) {
    RecordAxis axis;
    EXPECT_FALSE(axis.mayFollow(at(1, 1001)));
    axis.begin(at(1, 1001), true);
    EXPECT_TRUE(axis.mayFollow(at(1, 1001)));
    EXPECT_TRUE(axis.mayFollow(at(9, 1009)));
    EXPECT_FALSE(axis.mayFollow(at(0.5, 1001)));
    EXPECT_FALSE(axis.mayFollow(at(9, 1019)));
}

TEST(RecordAxis, TimesOutOfRangeAreRefused) {
    RecordAxis axis;
    EXPECT_THROW(axis.begin(at(-1, 1000), true), std::runtime_error);
    EXPECT_THROW(axis.begin(at(1e10, 1000), true), std::runtime_error);
    axis.begin(at(1, 1001), true);
    EXPECT_THROW(axis.follow(at(1e10, 1001)), std::runtime_error);
}

TEST(BeginOf, CountsMicroseconds) {
    EXPECT_EQ(beginOf({0.0000014, 1000000}), 999000U);
    EXPECT_EQ(beginOf({0.000001, 1000000}), 999000U);
    EXPECT_EQ(beginOf({2592000.123457, 1795261620276518056}), 1792669620153061056U);
}
