#include "ChronyFeed.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ListeningChronyd.h"
#include "Tool.h"

using namespace vantelhost;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

namespace {

constexpr std::uint64_t fullSecond = 1000000000;

/// Pairs of a PTP clock, eight a second. Its grandmaster keeps TAI, or UTC; the local times
/// have been carried over to the system's clock.
class ChronyFeedTest : public testing::Test {
protected:
    std::optional<Event> pair(std::int64_t offset = 0, bool keepsTai = true) {
        tai += fullSecond / 8;
        const std::uint64_t utc = tai - leaps * fullSecond;
        const std::uint64_t local = utc + static_cast<std::uint64_t>(clockIsAhead + offset);
        auto news = feed.take(keepsTai ? tai : utc, local, StampedBy::ptpClock);
        chronyd.read();
        return news;
    }

    void pairs(int count) {
        for (int i = 0; i < count; ++i) {
            pair(i % 10);
        }
    }

    Folder folder;
    std::string path = folder.path("chrony.sock");
    ListeningChronyd chronyd{path};
    std::int64_t kernels = 37; ///< what the kernel says
    ChronyFeed feed{path, TaiOffset(std::nullopt, [this] { return kernels; })};
    std::uint64_t leaps = 37; ///< what is true
    std::uint64_t tai = 1795261657 * fullSecond;
    std::int64_t clockIsAhead = 0; ///< of UTC, nanoseconds
};

constexpr double tolerance = 1e-6;

} // namespace

TEST_F(ChronyFeedTest, TaiIsTakenFromTheReference) {
    pair(250);
    pair(-250);
    EXPECT_THAT(chronyd.takeOffsets(), ElementsAre(testing::DoubleNear(-250e-9, 1e-12),
                                                   testing::DoubleNear(250e-9, 1e-12)));
    EXPECT_EQ(feed.clock().counts().withheld, 0U);
}

TEST_F(ChronyFeedTest, NothingIsTakenFromUtc) {
    pair(250, false);
    EXPECT_THAT(chronyd.takeOffsets(), ElementsAre(testing::DoubleNear(-250e-9, 1e-12)));
}

TEST_F(ChronyFeedTest, NothingIsTakenWherePtp4lHasDone) {
    feed.take(tai + 37 * fullSecond, tai, StampedBy::systemClock);
    EXPECT_THAT(chronyd.takeOffsets(), ElementsAre(37.0));
}

TEST_F(ChronyFeedTest, ATimescaleThatIsNotKnownIsAnErrorWhenItBeginsAndNothingIsHandedOn) {
    kernels = 0;
    const auto error = pair();
    ASSERT_TRUE(error);
    EXPECT_EQ(error->name, "error");
    EXPECT_EQ(error->members["operation"], "chronyd");
    EXPECT_THAT(error->members["problem"].get<std::string>(), HasSubstr("--tai-offset 37"));
    EXPECT_FALSE(pair());
    EXPECT_THAT(chronyd.takeOffsets(), SizeIs(0));
    EXPECT_EQ(feed.clock().counts().withheld, 2U);
    EXPECT_FALSE(feed.clock().tookNone());

    kernels = 37;
    EXPECT_EQ(pair().value().text, "takes the pairs; 1 sent, 0 failed, 2 withheld");
    kernels = 0;
    EXPECT_EQ(pair().value().name, "error") << "it begins anew";
}

/// Clock and TAI minus UTC are set one after the other, or at once as the kernel does it.
TEST_F(ChronyFeedTest, ALeapSecondInAnyOrderIsNoOffset) {
    const auto setClock = [this] { clockIsAhead -= static_cast<std::int64_t>(fullSecond); };
    const auto tellKernel = [this] { ++kernels; };
    for (const int order : {0, 1, 2}) {
        pairs(80);
        ++leaps;
        clockIsAhead += static_cast<std::int64_t>(fullSecond); // it has gone on
        order == 1 ? tellKernel() : setClock();
        if (order != 0) {
            pairs(80);
        }
        order == 1 ? setClock() : tellKernel();
        pairs(80);
        const auto offsets = chronyd.takeOffsets();
        EXPECT_THAT(offsets, SizeIs(160)) << order;
        EXPECT_THAT(offsets, Each(testing::DoubleNear(0, tolerance))) << order;
        EXPECT_EQ(feed.clock().counts().withheld, 80U * static_cast<unsigned>(order));
    }
}

TEST_F(ChronyFeedTest, ALeapSecondThatTheSystemsClockMissesIsTheOffsetInTheEnd) {
    pairs(80);
    chronyd.takeOffsets();
    ++leaps;
    ++kernels;
    clockIsAhead += static_cast<std::int64_t>(fullSecond);
    pairs(40 * 8);
    const auto offsets = chronyd.takeOffsets();
    EXPECT_THAT(offsets, Each(testing::DoubleNear(-1, tolerance)));
    EXPECT_THAT(offsets, SizeIs(80)) << "after 30 s";
}

TEST_F(ChronyFeedTest, ASystemsClockThatIsSteppedIsBelievedWithTheNextPair) {
    pairs(8);
    chronyd.takeOffsets();
    clockIsAhead = -300000000;
    pairs(2);
    EXPECT_THAT(chronyd.takeOffsets(), ElementsAre(testing::DoubleNear(0.3, tolerance)));
    EXPECT_EQ(feed.clock().counts().withheld, 1U);
}
