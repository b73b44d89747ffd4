#include "Clock/PtpClock.h"

#include <cerrno>
#include <system_error>

#include "Moment.h"
#include "Tool.h"
#include "support/PtpDevice.h"

using namespace vantelhost;
using Best = PtpDevice::Best;

namespace {

constexpr std::int64_t taiAhead = 37000000000;

/// Reads the clock three tenths of a bracket after its begin; the middle is told.
constexpr std::int64_t extendedError = shortestExtended * 3 / 10 - shortestExtended / 2;
constexpr std::int64_t kernelsError = shortestOfKernel * 3 / 10 - (shortestOfKernel + 1) / 2;

class PtpClockTest : public testing::Test {
protected:
    PtpClockTest() { set({taiAhead, Best::precise, 0}); }

    void set(const PtpDevice& device) const { writePtpDevice(path, device); }

    Folder folder;
    const std::string path = folder.path("ptp0");
};

/// By how much the clock is taiAhead of CLOCK_REALTIME, as a cross time stamp has it.
std::int64_t aheadIn(const std::optional<CrossTime>& cross) {
    return cross ? static_cast<std::int64_t>(cross->local - cross->realtime) : 0;
}

} // namespace

TEST_F(PtpClockTest, ItsTimeIsThatOfTheDevice) {
    const PtpClock clock(path);
    EXPECT_EQ(clock.name(), path);
    const auto before = realtimeNanoseconds() + taiAhead;
    const auto now = clock.now();
    ASSERT_TRUE(now);
    EXPECT_GE(*now, before);
    EXPECT_LE(*now, realtimeNanoseconds() + taiAhead);
}

TEST_F(PtpClockTest, WhatTheHardwareLatchesIsCertain) {
    PtpClock clock(path);
    const auto before = realtimeNanoseconds();
    const auto cross = clock.cross();
    ASSERT_TRUE(cross);
    EXPECT_EQ(aheadIn(cross), taiAhead);
    EXPECT_EQ(cross->uncertainty, 0U);
    EXPECT_GE(cross->realtime, before);
    EXPECT_LE(cross->realtime, realtimeNanoseconds());
}

TEST_F(PtpClockTest, OfTheDriversReadingsTheShortestCountsWithHalfOfItAsUncertainty) {
    set({taiAhead, Best::extended, 0});
    PtpClock clock(path);
    const auto cross = clock.cross();
    EXPECT_EQ(aheadIn(cross), taiAhead + extendedError);
    EXPECT_EQ(cross->uncertainty, 150U);
}

TEST_F(PtpClockTest, OfTheKernelsReadingsTheShortestCountsWithHalfOfItAsUncertainty) {
    set({taiAhead, Best::kernel, 0});
    PtpClock clock(path);
    const auto cross = clock.cross();
    EXPECT_EQ(aheadIn(cross), taiAhead + kernelsError);
    EXPECT_EQ(cross->uncertainty, 1001U);
}

TEST_F(PtpClockTest, AWayThatIsMissingIsNotTriedAgain) {
    set({taiAhead, Best::extended, 0});
    PtpClock clock(path);
    EXPECT_EQ(aheadIn(clock.cross()), taiAhead + extendedError);
    set({taiAhead, Best::precise, 0});
    EXPECT_EQ(aheadIn(clock.cross()), taiAhead + extendedError);
    set({taiAhead, Best::kernel, 0});
    EXPECT_EQ(aheadIn(clock.cross()), taiAhead + kernelsError);
    set({taiAhead, Best::precise, 0});
    EXPECT_EQ(aheadIn(clock.cross()), taiAhead + kernelsError);
}

TEST_F(PtpClockTest, AWayThatFailsOnceIsTriedAgain) {
    set({taiAhead, Best::precise, ETIMEDOUT});
    PtpClock clock(path);
    EXPECT_EQ(aheadIn(clock.cross()), taiAhead + extendedError);
    set({taiAhead, Best::precise, 0});
    EXPECT_EQ(aheadIn(clock.cross()), taiAhead);
}

TEST_F(PtpClockTest, WithoutAnyWayThereIsNoCrossTimeStamp) {
    set({taiAhead, Best::none, 0});
    PtpClock clock(path);
    EXPECT_FALSE(clock.cross());
    EXPECT_EQ(errno, ENOTTY);
    EXPECT_FALSE(clock.cross());
    EXPECT_EQ(errno, EOPNOTSUPP);
    EXPECT_TRUE(clock.now());
}

TEST_F(PtpClockTest, TheReasonOfAFailureIsThatOfTheLastWay) {
    set({taiAhead, Best::kernel, ENODEV});
    PtpClock clock(path);
    EXPECT_FALSE(clock.cross());
    EXPECT_EQ(errno, ENODEV);
}

TEST_F(PtpClockTest, ADeviceThatHasGoneCannotBeRead) {
    PtpClock clock(path);
    writeFile(path, "");
    EXPECT_FALSE(clock.now());
    EXPECT_EQ(errno, EINVAL);
    EXPECT_FALSE(clock.cross());
}

TEST_F(PtpClockTest, WhatIsNoClockIsNotTaken) {
    const std::string other = folder.path("other");
    writeFile(other, "");
    try {
        const PtpClock clock(other);
        FAIL() << "it was taken";
    } catch (const std::system_error& error) {
        EXPECT_EQ(error.code().value(), EINVAL);
        EXPECT_EQ(error.what(), other + ": Invalid argument");
    }
    try {
        const PtpClock clock(folder.path("none"));
        FAIL() << "it was taken";
    } catch (const std::system_error& error) {
        EXPECT_EQ(error.code().value(), ENOENT);
    }
}
