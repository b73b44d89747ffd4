#include <filesystem>
#include <numeric>

#include <gmock/gmock.h>
#include <sys/stat.h>

#include "SessionFixture.h"

namespace {

using testing::Each;
using testing::ElementsAre;

constexpr char noFifo[] = "Unable to call into KEL in vantel, got error: -52006";
constexpr char badFifo[] = "Unable to call into KEL in vantel, got error: -52008";

class EpochFifoTest : public SessionTest {
protected:
    EpochFifoTest() { fifo.reset(); }

    /// A new measurement with each poll: 1000, 2000, ...
    void beginMeasuring() {
        std::vector<FakePtp4l::Measurement> polls(100);
        for (std::size_t poll = 0; poll < polls.size(); ++poll) {
            polls[poll].ingressTime = 1000 * (poll + 1);
        }
        beginMeasured(polls);
    }

    /// The epoch offset of each pair, given that the ingress times are those above.
    std::vector<std::int64_t> epochs() const {
        std::vector<std::int64_t> offsets;
        for (const auto& call : host.calls(Function::adjustTime)) {
            offsets.push_back(static_cast<std::int64_t>(call.localTime - call.referenceTime));
        }
        return offsets;
    }
};

TEST_F(EpochFifoTest, CreatedLaterBringsThePairThatWasMissed) {
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForLog(noFifo));
    fifo.emplace();
    fifo->write({5});
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_EQ(host.calls(Function::adjustTime)[0].localTime, 1005U);
}

TEST_F(EpochFifoTest, NeverWrittenMeansNoOffset) {
    ASSERT_EQ(mkfifo(EpochFifo::path, 0600), 0);
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 3));
    EXPECT_THAT(epochs(), Each(0));
    EXPECT_EQ(log.count(badFifo), 0);
}

TEST_F(EpochFifoTest, EmptyWithAWriterKeepsTheOffset) {
    fifo.emplace();
    onEachPoll([this](int poll) {
        if (poll == 2) {
            fifo->write({-42});
        }
    });
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 5));
    auto offsets = epochs();
    offsets.resize(5);
    EXPECT_THAT(offsets, ElementsAre(0, 0, -42, -42, -42));
    EXPECT_EQ(log.count("Unable to call into KEL in vantel, got error: -52012"), 0);
}

TEST_F(EpochFifoTest, LastOfSeveralValuesCounts) {
    fifo.emplace();
    fifo->write({1, 2, 3});
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_EQ(epochs().at(0), 3);
    EXPECT_EQ(fifo->queued(), 0);
}

TEST_F(EpochFifoTest, PartialValueEndsTheDrainAndChangesNothing) {
    fifo.emplace();
    onEachPoll([this](int poll) {
        if (poll == 0) {
            fifo->write({7});
            fifo->writeOctets("abc");
        } else if (poll == 1) {
            fifo->writeOctets("abcdefg");
        } else if (poll == 2) {
            fifo->write({8});
        }
    });
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 3));
    auto offsets = epochs();
    offsets.resize(3);
    EXPECT_THAT(offsets, ElementsAre(7, 7, 8));
}

TEST_F(EpochFifoTest, OffsetStaysWhenTheWriterGoes) {
    fifo.emplace();
    fifo->write({9});
    onEachPoll([this](int poll) {
        if (poll == 1) {
            fifo.reset();
        }
    });
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 4));
    EXPECT_THAT(epochs(), Each(9));
}

TEST_F(EpochFifoTest, FullPipeIsReadToItsEnd) {
    fifo.emplace();
    std::vector<std::int64_t> values(8192);
    std::iota(values.begin(), values.end(), 1);
    fifo->write(values);
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    EXPECT_EQ(epochs().at(0), 8192);
}

TEST_F(EpochFifoTest, WhatIsBehindAPipeFullIsLeftToTheNextMeasurement) {
    // A file can hold more than a pipe.
    std::vector<std::int64_t> values(8193);
    std::iota(values.begin(), values.end(), 1);
    writeFile(EpochFifo::path,
              {reinterpret_cast<const char*>(values.data()), values.size() * sizeof(values[0])});
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 2));
    EXPECT_EQ(epochs().at(0), 8192);
    EXPECT_EQ(epochs().at(1), 8193);
}

TEST_F(EpochFifoTest, InitialiseDoesNotTouchThePath) {
    session.initialise();
    EXPECT_FALSE(std::filesystem::exists(EpochFifo::path));
    fifo.emplace();
    fifo->write({1});
    Session other;
    other.initialise();
    other.finalise();
    EXPECT_TRUE(std::filesystem::exists(EpochFifo::path));
    EXPECT_EQ(fifo->queued(), 8);
}

TEST_F(EpochFifoTest, SessionLeavesTheFifoToItsOwner) {
    fifo.emplace();
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    session.stop();
    session.finalise();
    EXPECT_TRUE(std::filesystem::exists(EpochFifo::path));
}

} // namespace
