#include "Clock.h"

#include <cstdint>
#include <limits>

#include <gtest/gtest.h>

namespace simptp4l {
namespace {

constexpr std::int64_t start = 1000;
constexpr std::int64_t second = 1000000000;

/// A clock whose offset grows by 1000 ns a second, with a Sync each second.
class Simptp4lClockBeforeDelay : public testing::Test {
protected:
    Simptp4lClockBeforeDelay() {
        script.clock = ClockSource::monotonic;
        script.offset = 5000000;
        script.driftPpb = 1000;
    }

    static void expect(const ClockReading& reading, std::int64_t ingressTime,
                       std::int64_t masterOffset) {
        EXPECT_EQ(reading.ingressTime, ingressTime);
        EXPECT_EQ(reading.masterOffset, masterOffset);
    }

    Script script;
};

TEST_F(Simptp4lClockBeforeDelay, FirstSyncChangesTheIngressTimeAlone) {
    Clock clock(script, 0, start);
    EXPECT_TRUE(clock.read(0).gmPresent);
    expect(clock.read(0), start, 0);
    expect(clock.read(second), start + second, 5001000);
}

TEST_F(Simptp4lClockBeforeDelay, SoDoAsManyAsTheScriptSays) {
    script.syncsBeforeDelay = 3;
    Clock clock(script, 0, start);
    expect(clock.read(2 * second), start + 2 * second, 0);
    expect(clock.read(3 * second), start + 3 * second, 5003000);
    script.syncsBeforeDelay = 0;
    Clock other(script, 0, start);
    expect(other.read(0), start, 5000000);
}

TEST_F(Simptp4lClockBeforeDelay, AReturnedGrandmasterShowsTheLastOffsetAtFirst) {
    Clock clock(script, 0, start);
    expect(clock.read(2 * second), start + 2 * second, 5002000);
    clock.setGrandmaster(false, 2 * second);
    expect(clock.read(4 * second), 0, 5002000);
    clock.setGrandmaster(true, 5 * second);
    expect(clock.read(5 * second), start + 5 * second, 5002000);
    expect(clock.read(6 * second), start + 6 * second, 5006000);
}

TEST_F(Simptp4lClockBeforeDelay, AllSyncsNeverShowAnOffset) {
    script.syncsBeforeDelay = std::numeric_limits<std::uint64_t>::max();
    Clock clock(script, 0, start);
    expect(clock.read(1000000 * second), start + 1000000 * second, 0);
}

} // namespace
} // namespace simptp4l
