#include "Clock/LikelyClock.h"

#include <ctime>

#include "Moment.h"
#include "Tool.h"
#include "support/PtpDevice.h"

using namespace vantelhost;
using testing::ElementsAre;
using testing::Field;

namespace {

const std::vector<KnownClock> known{{"CLOCK_REALTIME", "realtime", 1000000000000},
                                    {"/dev/ptp0", "/dev/ptp0", 5000000000000},
                                    {"TAI", "", 1037000000000}};

} // namespace

TEST(LikelyClock, TheClockThatIsMeantIsNamedWithItsOption) {
    EXPECT_EQ(otherClockText(1000000000000 - 20000000, "/dev/ptp0", known),
              "the local time of this pair is that of CLOCK_REALTIME, not of /dev/ptp0: "
              "--clock realtime?");
    EXPECT_EQ(otherClockText(5000000000000, "CLOCK_REALTIME", known),
              "the local time of this pair is that of /dev/ptp0, not of CLOCK_REALTIME: "
              "--clock /dev/ptp0?");
}

TEST(LikelyClock, AClockWithoutAnOptionIsNamed) {
    EXPECT_EQ(otherClockText(1037000000000, "CLOCK_REALTIME", known),
              "the local time of this pair is that of TAI, not of CLOCK_REALTIME");
}

TEST(LikelyClock, ATimeOfNoClockSaysSo) {
    EXPECT_EQ(otherClockText(990, "/dev/ptp0", known),
              "the local time of this pair, 990 ns, is not of /dev/ptp0, nor of any clock that can "
              "be read here");
}

TEST(LikelyClock, ItIsNeverTheClockThatItIsNotOf) {
    // That may have been set meanwhile.
    EXPECT_THAT(otherClockText(5000000000000, "/dev/ptp0", known),
                testing::HasSubstr("nor of any clock"));
}

TEST(LikelyClock, RealtimeDevicesTaiAndMonotonicAreKnown) {
    const Folder folder;
    writePtpDevice(folder.path("ptp1"), {5000000000, PtpDevice::Best::none, 0});
    writeFile(folder.path("ptp0"), "");      // cannot be read
    writeFile(folder.path("ptp_kvm"), "");   // another name of one
    writePtpDevice(folder.path("rtc0"), {}); // no PTP clock by its name
    const auto clocks = knownClocks(folder.path(""));
    const auto now = realtimeNanoseconds();
    ASSERT_THAT(clocks, ElementsAre(Field(&KnownClock::name, "CLOCK_REALTIME"),
                                    Field(&KnownClock::option, testing::EndsWith("/ptp1")),
                                    Field(&KnownClock::name, "TAI"),
                                    Field(&KnownClock::name, "CLOCK_MONOTONIC")));
    EXPECT_TRUE(isOfClock(clocks[0].now, now));
    EXPECT_TRUE(isOfClock(clocks[1].now, now + 5000000000));
    const auto tai = static_cast<std::int64_t>(clocks[2].now - clocks[0].now);
    EXPECT_GT(tai, 30000000000);
    EXPECT_LT(tai, 45000000000);
    timespec monotonic{};
    ::clock_gettime(CLOCK_MONOTONIC, &monotonic);
    EXPECT_TRUE(
        isOfClock(clocks[3].now, static_cast<std::uint64_t>(monotonic.tv_sec) * 1000000000));
}

TEST(LikelyClock, WithoutAFolderOfDevicesTheOthersAreKnown) {
    EXPECT_EQ(knownClocks("/none").size(), 3U);
}
