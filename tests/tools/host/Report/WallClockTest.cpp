#include "Report/WallClock.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace vantelhost {

static bool operator==(const WallTick& a, const WallTick& b) {
    return a.seconds == b.seconds && a.label == b.label;
}

} // namespace vantelhost

TEST(WallClock, StepsAreRoundAndNotTooMany) {
    EXPECT_EQ(roundStep(0.5, 10), 1);
    EXPECT_EQ(roundStep(10, 10), 1);
    EXPECT_EQ(roundStep(10.5, 10), 2);
    EXPECT_EQ(roundStep(300, 4.5), 120);
    EXPECT_EQ(roundStep(86401, 4.5), 6 * 3600);
    EXPECT_EQ(roundStep(86400 * 12, 12), 86400);
    EXPECT_EQ(roundStep(86400 * 100, 12), 86400 * 16);
    EXPECT_GT(static_cast<double>(roundStep(3.2e9, 4.5)) * 4.5, 3.2e9);
}

TEST(WallClock, TicksAreAtMultiplesOfTheStep) {
    // 2026-11-21 11:47:00.25
    EXPECT_THAT(wallTicks(1795261620250000000, 90, 30),
                ElementsAre(WallTick{29.75, "11:47:30"}, WallTick{59.75, "11:48:00"},
                            WallTick{89.75, "11:48:30"}));
    EXPECT_THAT(wallTicks(1795261620250000000, 4000, 1800),
                ElementsAre(WallTick{779.75, "12:00"}, WallTick{2579.75, "12:30"}));
}

TEST(WallClock, MidnightIsTheDate) {
    EXPECT_THAT(wallTicks(1795294800000000000, 12 * 3600, 6 * 3600),
                ElementsAre(WallTick{10800, "11-22"}, WallTick{32400, "06:00"}));
}

TEST(WallClock, ATickMayBeAtTheBeginningAndAtTheEnd) {
    EXPECT_THAT(wallTicks(60000000000, 60, 60),
                ElementsAre(WallTick{0, "00:01"}, WallTick{60, "00:02"}));
}
