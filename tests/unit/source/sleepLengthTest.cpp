#include "sleepLength.h"

#include <ostream>
#include <string>

#include <gtest/gtest.h>

using zekelVantel::sleepLength;

namespace {

constexpr std::uint64_t microsecond = 1000;
constexpr std::uint64_t millisecond = 1000000;
constexpr std::uint64_t second = 1000000000;

/// A time that no arithmetic on 32 bits could keep.
constexpr std::uint64_t someTime = 1700000000123456789;

// The last nanosecond whose seconds have so many bits: in 2038, in 2106.
constexpr std::uint64_t lastOf31Bits = 2147483647999999999;
constexpr std::uint64_t lastOf32Bits = 4294967295999999999;

struct Row {
    const char* name;
    std::uint64_t elapsed; ///< ns; from 2^63 on: the host's time is before the Sync
    std::uint32_t expected;
};

void PrintTo(const Row& row, std::ostream* out) {
    *out << row.name;
}

class SleepLengthTest : public testing::TestWithParam<Row> {};

TEST_P(SleepLengthTest, FollowsFromTheTimeSinceTheSync) {
    for (const std::uint64_t ingressTime : {std::uint64_t{0}, someTime, lastOf31Bits, lastOf32Bits,
                                            std::uint64_t{UINT64_MAX}, std::uint64_t{1} << 63}) {
        EXPECT_EQ(sleepLength(ingressTime + GetParam().elapsed, ingressTime), GetParam().expected)
            << ingressTime;
    }
}

const Row aimed[] = {
    {"AtOnce", 0, 125000},
    {"OneNanosecond", 1, 125000},
    {"OneMicrosecond", microsecond, 125000},
    {"LongestSleepReached", 3000 * microsecond, 125000},
    {"FractionsOfAMicrosecondAreCut", 3001 * microsecond - 1, 125000},
    {"FirstShorterSleep", 3001 * microsecond, 124999},
    {"TenMilliseconds", 10 * millisecond, 118000},
    {"HundredMilliseconds", 100 * millisecond, 28000},
    {"LastBeforeTheShortest", 111999 * microsecond, 16001},
    {"ShortestReached", 112000 * microsecond, 16000},
    {"ShortestHeld", 112001 * microsecond, 16000},
    {"HundredAndTwentyMilliseconds", 120 * millisecond, 16000},
    {"LastMicrosecondBeforeTheAim", 127999 * microsecond, 16000},
    {"AtTheAim", 128000 * microsecond, 16000},
    {"LastNanosecondAtTheAim", 128001 * microsecond - 1, 16000},
};

// An aim that has passed is as far away as can be, on unsigned numbers.
const Row past[] = {
    {"OneMicrosecondLate", 128001 * microsecond, 125000},
    {"TwoHundredMilliseconds", 200 * millisecond, 125000},
    {"OneSecond", second, 125000},
    {"OneHour", 3600 * second, 125000},
    {"Half32Bits", 0x80000000 * microsecond, 125000},
    {"LastOf32Bits", 0xFFFFFFFF * microsecond, 125000},
};

// The microseconds are cut to 32 bits: after 71 minutes they begin anew.
const Row wrapped[] = {
    {"WrappedToZero", 0x100000000 * microsecond, 125000},
    {"WrappedToTheFirstShorterSleep", (0x100000000 + 3001) * microsecond, 124999},
    {"WrappedToHundredMilliseconds", (0x100000000 + 100000) * microsecond, 28000},
    {"WrappedToTheShortest", (0x100000000 + 112000) * microsecond, 16000},
    {"WrappedToTheAim", (0x100000000 + 128000) * microsecond, 16000},
    {"WrappedPastTheAim", (0x100000000 + 128001) * microsecond, 125000},
    {"WrappedTwentyTimes", (20 * 0x100000000 + 100000) * microsecond, 28000},
};

// 2^64 ns are 18446744073709551 us and a fraction; their low 32 bits are 0x4BC6A7EF, and the rest
// of the subtraction from 128000 lies far above the longest sleep.
const Row beforeTheSync[] = {
    {"OneNanosecondEarly", 0 - std::uint64_t{1}, 125000},
    {"OneMicrosecondEarly", 0 - microsecond, 125000},
    {"OneSecondEarly", 0 - second, 125000},
    {"FarthestEarly", std::uint64_t{1} << 63, 125000},
    // 18446744073709551 - 1271310319 (0x4BC6A7EF) us leave low bits of 0.
    {"EarlyAndWrappedToZero", (18446744073709551 - 1271310319) * microsecond, 125000},
    {"EarlyAndWrappedToHundredMilliseconds",
     (18446744073709551 - 1271310319 + 100000) * microsecond, 28000},
    {"EarlyAndWrappedToTheShortest", (18446744073709551 - 1271310319 + 112001) * microsecond,
     16000},
};

std::string nameOf(const testing::TestParamInfo<Row>& row) {
    return row.param.name;
}

INSTANTIATE_TEST_SUITE_P(Aimed, SleepLengthTest, testing::ValuesIn(aimed), nameOf);
INSTANTIATE_TEST_SUITE_P(Past, SleepLengthTest, testing::ValuesIn(past), nameOf);
INSTANTIATE_TEST_SUITE_P(Wrapped, SleepLengthTest, testing::ValuesIn(wrapped), nameOf);
INSTANTIATE_TEST_SUITE_P(BeforeTheSync, SleepLengthTest, testing::ValuesIn(beforeTheSync), nameOf);

TEST(SleepLengthBoundsTest, NothingIsShorterThanTheShortestOrLongerThanTheLongest) {
    for (std::uint64_t elapsed = 0; elapsed < 200000; elapsed += 7) {
        const std::uint32_t length = sleepLength(someTime + elapsed * microsecond, someTime);
        EXPECT_GE(length, 16000U);
        EXPECT_LE(length, 125000U);
    }
}

} // namespace
