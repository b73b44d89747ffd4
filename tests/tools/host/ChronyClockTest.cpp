#include "ChronyClock.h"

#include <cstring>

#include <unistd.h>

#include "ListeningChronyd.h"
#include "SockSample.h"
#include "Tool.h"
#include "UsageError.h"

using namespace vantelhost;

namespace {

template <typename Number>
Number numberAt(const std::string& octets, std::size_t position) {
    Number number{};
    std::memcpy(&number, octets.data() + position, sizeof(number));
    return number;
}

class ChronyClockTest : public testing::Test {
protected:
    Folder folder;
    std::string path = folder.path("chrony.sock");
    ChronyClock clock{path};
};

constexpr std::uint64_t local = 1700000000123456789;
constexpr std::uint64_t reference = local - 5000000;

} // namespace

TEST(SockSample, HasChronysLayoutOn64Bits) {
    if (sizeof(long) != 8) {
        GTEST_SKIP() << "SKIPPED: the platform's times have 32 bits";
    }
    const auto sample = sockSample(reference, local);
    ASSERT_EQ(sample.size(), 40U);
    EXPECT_EQ(numberAt<std::int64_t>(sample, 0), 1700000000);
    EXPECT_EQ(numberAt<std::int64_t>(sample, 8), 123456);
    EXPECT_DOUBLE_EQ(numberAt<double>(sample, 16), -0.005);
    EXPECT_EQ(numberAt<std::int32_t>(sample, 24), 0); // no pulse
    EXPECT_EQ(numberAt<std::int32_t>(sample, 28), 0); // no leap second
    EXPECT_EQ(numberAt<std::int32_t>(sample, 32), 0);
    EXPECT_EQ(sample.substr(36), "KCOS");
}

TEST(SockSample, HasThePlatformsOwnTimesOn32Bits) {
    if (sizeof(long) != 4) {
        GTEST_SKIP() << "SKIPPED: the platform's times have 64 bits";
    }
    const auto sample = sockSample(reference, local);
    ASSERT_EQ(sample.size(), 32U);
    EXPECT_EQ(numberAt<std::int32_t>(sample, 0), 1700000000);
    EXPECT_EQ(numberAt<std::int32_t>(sample, 4), 123456);
    EXPECT_DOUBLE_EQ(numberAt<double>(sample, 8), -0.005);
    EXPECT_EQ(sample.substr(28), "KCOS");
}

TEST(SockSample, OffsetIsWhatTheLocalTimeLacks) {
    const auto position = 2 * sizeof(long);
    EXPECT_DOUBLE_EQ(numberAt<double>(sockSample(1005000000, 1000000000), position), 0.005);
    EXPECT_DOUBLE_EQ(numberAt<double>(sockSample(1, 2), position), -1e-9);
}

TEST_F(ChronyClockTest, PairsArriveAndTheFirstIsTold) {
    const ListeningChronyd chronyd(path);
    const auto news = clock.take(reference, local);
    ASSERT_TRUE(news.has_value());
    EXPECT_EQ(news->text, "takes the pairs; 1 sent, 0 failed");
    EXPECT_FALSE(clock.take(reference + 1, local).has_value());
    EXPECT_EQ(chronyd.receive(), sockSample(reference, local));
    EXPECT_EQ(chronyd.receive(), sockSample(reference + 1, local));
    EXPECT_EQ(chronyd.receive(), "");
    EXPECT_EQ(clock.state().members["sent"], 2);
}

TEST_F(ChronyClockTest, AMissingChronydIsToldOnceAndCounted) {
    const auto news = clock.take(reference, local);
    ASSERT_TRUE(news.has_value());
    EXPECT_EQ(news->members["reachable"], false);
    EXPECT_EQ(news->members["problem"], path + ": No such file or directory");
    EXPECT_FALSE(clock.take(reference, local).has_value());
    EXPECT_EQ(clock.state().members["failed"], 2);
}

TEST_F(ChronyClockTest, WhatIsWithheldIsCounted) {
    const ListeningChronyd chronyd(path);
    clock.withhold();
    EXPECT_FALSE(clock.tookNone());
    EXPECT_EQ(clock.take(reference, local).value().text,
              "takes the pairs; 1 sent, 0 failed, 1 withheld");
}

TEST_F(ChronyClockTest, ARestartedChronydGetsPairsAgain) {
    {
        const ListeningChronyd chronyd(path);
        clock.take(reference, local);
    }
    EXPECT_EQ(clock.take(reference, local).value().members["problem"],
              path + ": Connection refused");
    ::unlink(path.c_str());
    EXPECT_FALSE(clock.take(reference, local).has_value());
    const ListeningChronyd chronyd(path);
    EXPECT_EQ(clock.take(reference, local).value().text, "takes the pairs; 2 sent, 2 failed");
    EXPECT_EQ(chronyd.receive(), sockSample(reference, local));
}

TEST_F(ChronyClockTest, AChronydThatDoesNotReadIsNotWaitedFor) {
    const ListeningChronyd chronyd(path);
    clock.take(reference, local);
    for (int i = 0; i < 100000 && clock.state().members["failed"] == 0; ++i) {
        clock.take(reference, local);
    }
    EXPECT_EQ(clock.state().members["failed"], 1);
    EXPECT_EQ(clock.state().members["problem"], path + ": Resource temporarily unavailable");
}

TEST_F(ChronyClockTest, WithoutPairsThatIsTold) {
    EXPECT_EQ(clock.state().text, "does not take the pairs: there was none; 0 sent, 0 failed");
}

TEST(ChronyClock, APathThatIsTooLongIsRefused) {
    EXPECT_THROW(ChronyClock(std::string(108, 'x')), UsageError);
    EXPECT_NO_THROW(ChronyClock(std::string(107, 'x')));
}
