#include <algorithm>
#include <ostream>

#include <gmock/gmock.h>

#include "SessionFixture.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

struct Pair {
    std::uint64_t reference;
    std::uint64_t local;
    bool operator==(const Pair& other) const {
        return reference == other.reference && local == other.local;
    }
};

void PrintTo(const Pair& pair, std::ostream* out) {
    *out << std::hex << "0x" << pair.reference << " at 0x" << pair.local;
}

class TimePairTest : public SessionTest {
protected:
    std::vector<Pair> pairs() const {
        std::vector<Pair> all;
        for (const auto& call : host.calls(Function::adjustTime)) {
            all.push_back({call.referenceTime, call.localTime});
        }
        return all;
    }
};

constexpr std::uint64_t minus(std::uint64_t value) {
    return 0 - value;
}

TEST_F(TimePairTest, IsIngressMinusOffsetAtIngressPlusEpoch) {
    fifo->write({37000000000});
    begin("clock fixed 1700000000000000000\n"
          "offset 250\n"
          "syncs-before-delay 0\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_THAT(pairs(), ElementsAre(Pair{1699999999999999750, 1700000037000000000}));
}

TEST_F(TimePairTest, NegativeOffsetAndEpoch) {
    fifo->write({-37000000000});
    begin("clock fixed 1700000000000000000\n"
          "offset -250\n"
          "syncs-before-delay 0\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_THAT(pairs(), ElementsAre(Pair{1700000000000000250, 1699999963000000000}));
}

TEST_F(TimePairTest, FirstOneHasTheOffset0OfADaemonThatKnowsNoDelayYet) {
    begin("clock fixed 1700000000000000000\n"
          "offset 5000000\n"
          "sync-interval 3600\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_THAT(pairs(), ElementsAre(Pair{1700000000000000000, 1700000000000000000}));
    EXPECT_THAT(qualities(), ElementsAre(QualityReport{"Waiting for ptp4l status", false},
                                         QualityReport{"PTP role has changed.", true}));
}

TEST_F(TimePairTest, AllHaveTheOffset0OfADaemonThatNeverKnowsADelay) {
    begin("clock monotonic\n"
          "offset 37000000000\n"
          "syncs-before-delay all\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 5));
    for (const Pair& pair : pairs()) {
        EXPECT_EQ(pair.reference, pair.local);
    }
    EXPECT_TRUE(qualities().back().usable);
}

TEST_F(TimePairTest, GrandmasterThatReturnsBeginsWithTheOffsetOfBefore) {
    beginMeasured({{250, 1000, 1}, {250, 0, 0}, {250, 9000, 1}, {minus(70), 9500, 1}});
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 4));
    EXPECT_THAT(pairs(), ElementsAre(Pair{750, 1000}, Pair{minus(250), 0}, Pair{8750, 9000},
                                     Pair{9570, 9500}));
}

TEST_F(TimePairTest, GrandmasterThatGoesGivesOneOf1970) {
    fifo->write({37000000000});
    begin("clock fixed 1700000000000000000\n"
          "offset 250\n"
          "syncs-before-delay 0\n"
          "on PARENT_DATA_SET after 2 times 1 do gm off\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 6));
    EXPECT_THAT(pairs(), ElementsAre(Pair{1699999999999999750, 1700000037000000000},
                                     Pair{minus(250), 37000000000}));
    EXPECT_EQ(qualities().back(), (QualityReport{"PTP role has changed.", false}));
}

TEST_F(TimePairTest, ArithmeticIsModuloTwoToTheSixtyFour) {
    static constexpr std::int64_t epochs[] = {
        0, 0, 0, 0, 1, -1, INT64_MAX, INT64_MIN, INT64_MIN, 0x0123456789ABCDEF};
    onEachPoll([this](int poll) {
        if (poll < 10) {
            fifo->write({epochs[poll]});
        }
    });
    beginMeasured({{0, 1, 0},
                   {2, 0xFFFFFFFFFFFFFFFF, 0},
                   {2, 1, 0},
                   {minus(1), 0xFFFFFFFFFFFFFFFE, 0},
                   {0, 0xFFFFFFFFFFFFFFFF, 0},
                   {0, 0, 0},
                   {5, 0x8000000000000001, 0},
                   {0x8000000000000000, 0x8000000000000000, 0},
                   {0x7FFFFFFFFFFFFFFF, 0x7FFFFFFFFFFFFFFF, 0},
                   {0x1111111111111111, 0xFEDCBA9876543210, 0}});
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 10));
    EXPECT_THAT(pairs(),
                ElementsAre(Pair{1, 1}, Pair{0xFFFFFFFFFFFFFFFD, 0xFFFFFFFFFFFFFFFF},
                            Pair{0xFFFFFFFFFFFFFFFF, 1},
                            Pair{0xFFFFFFFFFFFFFFFF, 0xFFFFFFFFFFFFFFFE},
                            Pair{0xFFFFFFFFFFFFFFFF, 0}, Pair{0, 0xFFFFFFFFFFFFFFFF},
                            Pair{0x7FFFFFFFFFFFFFFC, 0}, Pair{0, 0}, Pair{0, 0xFFFFFFFFFFFFFFFF},
                            Pair{0xEDCBA987654320FF, 0xFFFFFFFFFFFFFFFF}));
}

TEST_F(TimePairTest, TimesBeyond32BitsOfSecondsAreKeptToTheNanosecond) {
    fifo->write({37000000001});
    beginMeasured({{250, 2147483647999999999, 0},
                   {250, 2147483648000000000, 0},
                   {minus(250), 4294967295999999999, 0},
                   {minus(250), 4294967296000000000, 0},
                   {3000000000, 9223372036854775807, 0}});
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 5));
    EXPECT_THAT(pairs(), ElementsAre(Pair{2147483647999999749, 2147483685000000000},
                                     Pair{2147483647999999750, 2147483685000000001},
                                     Pair{4294967296000000249, 4294967333000000000},
                                     Pair{4294967296000000250, 4294967333000000001},
                                     Pair{9223372033854775807, 9223372073854775808U}));
}

TEST_F(TimePairTest, UnchangedIngressGivesNoPairAndReadsNoEpoch) {
    onEachPoll([this](int poll) {
        if (poll == 1) {
            fifo->write({1});
        }
    });
    beginMeasured({{0, 1000, 0}});
    ASSERT_TRUE(waitForCalls(Function::getTime, 5));
    EXPECT_THAT(pairs(), ElementsAre(Pair{1000, 1000}));
    EXPECT_EQ(fifo->queued(), 8);
}

TEST_F(TimePairTest, FirstIngressOfZeroIsNoMeasurement) {
    fifo->write({1});
    beginMeasured({{7, 0, 0}});
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_THAT(pairs(), IsEmpty());
    EXPECT_EQ(fifo->queued(), 8);
}

TEST_F(TimePairTest, IngressThatGoesBackIsAMeasurement) {
    beginMeasured({{0, 1000, 0}, {0, 999, 0}, {0, 0, 0}});
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 3));
    ASSERT_TRUE(waitForCalls(Function::getTime, 5));
    EXPECT_THAT(pairs(), ElementsAre(Pair{1000, 1000}, Pair{999, 999}, Pair{0, 0}));
}

TEST_F(TimePairTest, ChangedOffsetAloneIsNoMeasurement) {
    beginMeasured({{1, 1000, 0}, {2, 1000, 0}, {3, 1000, 1}});
    ASSERT_TRUE(waitForCalls(Function::getTime, 5));
    EXPECT_THAT(pairs(), ElementsAre(Pair{999, 1000}));
}

} // namespace
