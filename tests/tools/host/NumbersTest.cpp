#include "Numbers.h"

#include <limits>

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(Numbers, IntegersOf64BitsAreRead) {
    EXPECT_EQ(parseInteger("0"), 0);
    EXPECT_EQ(parseInteger("-17"), -17);
    EXPECT_EQ(parseInteger("9223372036854775807"), std::numeric_limits<std::int64_t>::max());
    EXPECT_EQ(parseInteger("-9223372036854775808"), std::numeric_limits<std::int64_t>::min());
}

TEST(Numbers, AnythingElseIsNoInteger) {
    for (const char* text : {"", "-", "x", "1x", " 1", "1 ", "1.0", "0x10", "1e3",
                             "9223372036854775808", "-9223372036854775809"}) {
        EXPECT_EQ(parseInteger(text), std::nullopt) << text;
    }
}

TEST(Numbers, SecondsMayHaveAFraction) {
    EXPECT_EQ(parseSeconds("0"), 0.0);
    EXPECT_EQ(parseSeconds("0.25"), 0.25);
    EXPECT_EQ(parseSeconds("1000000000"), 1e9);
}

TEST(Numbers, SecondsAreNeitherNegativeNorEndless) {
    for (const char* text : {"", "-1", "-0.001", "nan", "inf", "1000000001", "1s"}) {
        EXPECT_EQ(parseSeconds(text), std::nullopt) << text;
    }
}
