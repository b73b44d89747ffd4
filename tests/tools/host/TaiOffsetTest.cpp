#include "TaiOffset.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/timex.h>

using namespace vantelhost;
using testing::HasSubstr;

namespace {

TaiOffset ofKernel(std::int64_t seconds) {
    return TaiOffset(std::nullopt, [seconds] { return seconds; });
}

TaiOffset ofUser(std::int64_t seconds) {
    return TaiOffset(seconds, [] {
        ADD_FAILURE() << "the kernel is asked";
        return 0;
    });
}

/// @param ahead seconds
std::optional<std::int64_t> taken(const TaiOffset& offset, double ahead) {
    return offset.of(static_cast<std::int64_t>(ahead * 1e9)).seconds;
}

} // namespace

TEST(TaiOffset, TheKernelsIsThatOfAdjtimex) {
    timex state{};
    if (::adjtimex(&state) < 0) {
        GTEST_SKIP() << "SKIPPED: adjtimex is forbidden here";
    }
    EXPECT_EQ(kernelTaiOffset(), state.tai);
}

TEST(TaiOffset, OfAGrandmasterThatKeepsTaiTheKernelsIsTaken) {
    for (const double ahead : {37.0, 36.9, 37.05, 20.0, 55.0}) {
        EXPECT_EQ(taken(ofKernel(37), ahead), 37) << ahead;
    }
}

TEST(TaiOffset, OfAGrandmasterThatKeepsUtcNothingIsTaken) {
    for (const double ahead : {0.0, -0.4, 18.0, -18.0}) {
        EXPECT_EQ(taken(ofKernel(37), ahead), 0) << ahead;
        EXPECT_EQ(taken(ofUser(37), ahead), 0) << ahead;
    }
    for (const double ahead : {0.0, 14.0, -14.0}) {
        EXPECT_EQ(taken(ofKernel(0), ahead), 0) << ahead;
    }
}

TEST(TaiOffset, WithoutTheKernelsAGrandmasterThatKeepsTaiIsRefused) {
    const auto answer = ofKernel(0).of(37012345678);
    EXPECT_FALSE(answer.seconds);
    EXPECT_EQ(answer.problem,
              "the grandmaster's time is 37.012 s ahead of this machine's, and the kernel does not "
              "know TAI minus UTC: set the clock, or say --tai-offset 37 where the grandmaster "
              "keeps TAI, 0 where it keeps UTC");
}

TEST(TaiOffset, AClockThatIsFarOffShowsNoTimescale) {
    for (const double ahead : {3600.0, -37.0, 1.7e9}) {
        const auto answer = ofKernel(37).of(static_cast<std::int64_t>(ahead * 1e9));
        EXPECT_FALSE(answer.seconds) << ahead;
        EXPECT_THAT(answer.problem, HasSubstr("TAI is 37 s ahead of UTC for the kernel"));
        EXPECT_EQ(taken(ofUser(37), ahead), 37) << ahead;
    }
}

TEST(TaiOffset, ZeroTakesNothingFromAnyGrandmaster) {
    for (const double ahead : {0.0, 37.0, -5000.0, 1.7e9}) {
        EXPECT_EQ(taken(ofUser(0), ahead), 0) << ahead;
    }
}

TEST(TaiOffset, TheKernelIsAskedEachTime) {
    std::int64_t seconds = 37;
    const TaiOffset offset(std::nullopt, [&] { return seconds; });
    EXPECT_EQ(taken(offset, 37), 37);
    seconds = 38;
    EXPECT_EQ(taken(offset, 38), 38);
}
