#include "Clock.h"
#include "support/SystemClock.h"

#include <gtest/gtest.h>

namespace simptp4l {
namespace {

constexpr std::int64_t second = 1000000000;

/// The ingress time of the first Sync, on a system that has just been started.
std::int64_t firstIngress(const Script& script) {
    timespec time{};
    clock_gettime(CLOCK_MONOTONIC, &time);
    return Clock(script, 0, std::int64_t{time.tv_sec} * second + time.tv_nsec).read(0).ingressTime;
}

TEST(Simptp4lClockAfter2038, RealtimeGoesOnBeyond32BitsOfSeconds) {
    for (const std::int64_t seconds :
         {INT64_C(1700000000), INT64_C(2147483647), INT64_C(2147483648), INT64_C(4294967296)}) {
        const StoppedRealtime stopped(seconds * second + 999999999);
        // What passes on the other clock between two looks at it.
        EXPECT_LE(firstIngress({}), seconds * second + 999999999);
        EXPECT_GT(firstIngress({}), (seconds - 60) * second);
    }
}

TEST(Simptp4lClockAfter2038, FixedTimeIsKeptToTheNanosecond) {
    Script script;
    script.clock = ClockSource::fixed;
    for (const std::int64_t time : {INT64_C(2147483647999999999), INT64_C(2147483648000000001),
                                    INT64_C(4294967296000000001)}) {
        script.fixedTime = time;
        EXPECT_EQ(firstIngress(script), time);
    }
}

} // namespace
} // namespace simptp4l
