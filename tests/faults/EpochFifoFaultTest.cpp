// Something else than a FIFO with whole values where the epoch offsets should come from.

#include <atomic>
#include <filesystem>
#include <stdexcept>
#include <thread>

#include <gmock/gmock.h>
#include <syslog.h>

#include "FaultTest.h"

namespace {

using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class EpochFifoFaultTest : public FaultTest {
protected:
    EpochFifoFaultTest() { fifo.reset(); }

    /// A new measurement with each poll.
    void beginMeasuring() {
        std::vector<FakePtp4l::Measurement> polls;
        for (std::uint64_t ingressTime = 1000; ingressTime <= 100000; ingressTime += 1000) {
            polls.push_back({0, ingressTime, 1});
        }
        beginMeasured(polls);
        helpers.threads = 1;
    }

    /// The epoch offset of each pair.
    std::vector<std::int64_t> epochs() const {
        std::vector<std::int64_t> offsets;
        for (const auto& call : host.calls(Function::adjustTime)) {
            offsets.push_back(static_cast<std::int64_t>(call.localTime - call.referenceTime));
        }
        return offsets;
    }

    /// Expects that each measurement ends in an error, and not in a pair. What else a poll brings
    /// is then news in each: the role, whose report comes first, and the metadata, which never
    /// does.
    void expectErrorForEachMeasurement(int code) {
        const SyslogCapture::Line error{LOG_ERR, "Unable to call into KEL in vantel, got error: " +
                                                     std::to_string(code)};
        ASSERT_TRUE(waitForLog(error.text, 3));
        EXPECT_THAT(log.lines(), Contains(error));
        EXPECT_THAT(host.calls(Function::adjustTime), IsEmpty());
        auto reports = qualities();
        reports.resize(4);
        EXPECT_THAT(reports, ElementsAre(waiting, usable, usable, usable));
        EXPECT_THAT(metaData(), SizeIs(1));
    }

    void expectNoError() const {
        EXPECT_THAT(qualities(), ElementsAre(waiting, usable));
        EXPECT_THAT(log.lines(), Each(testing::Field(&SyslogCapture::Line::priority, LOG_INFO)));
    }
};

TEST_F(EpochFifoFaultTest, AbsentGivesNoPairAndAnErrorForEachMeasurement) {
    beginMeasuring();
    expectErrorForEachMeasurement(-52006);
    EXPECT_FALSE(std::filesystem::exists(EpochFifo::path));
    expectStopWithin({});
}

TEST_F(EpochFifoFaultTest, FolderInItsPlaceGivesNoPairAndAnErrorForEachMeasurement) {
    std::filesystem::create_directory(EpochFifo::path);
    beginMeasuring();
    expectErrorForEachMeasurement(-52008);
    expectStopWithin({});
}

TEST_F(EpochFifoFaultTest, RegularFileIsReadLikeAFifo) {
    const std::int64_t values[] = {11, 12};
    writeFile(EpochFifo::path, {reinterpret_cast<const char*>(values), sizeof(values)});
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 2));
    EXPECT_THAT(epochs(), Each(12));
    expectNoError();
    expectStopWithin({});
}

// It is opened once; who makes a new one restarts the session.
TEST_F(EpochFifoFaultTest, RecreatedIsNotOpenedAgain) {
    fifo.emplace();
    fifo->write({9});
    onEachPoll([this](int poll) {
        if (poll == 1) {
            fifo.reset();
            fifo.emplace();
            fifo->write({10});
        }
    });
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 4));
    EXPECT_THAT(epochs(), Each(9));
    EXPECT_EQ(fifo->queued(), 8);
    expectNoError();
    expectStopWithin({});
}

TEST_F(EpochFifoFaultTest, WriterThatNeverPausesCannotHoldTheWorker) {
    // Always has eight octets more.
    std::filesystem::create_symlink("/dev/zero", EpochFifo::path);
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 3));
    expectNoError();
    expectStopWithin({});
}

TEST_F(EpochFifoFaultTest, BusyWriterIsServed) {
    fifo.emplace();
    std::atomic<bool> done{false};
    std::atomic<int> refused{0}; // by a full pipe
    std::thread writer([&] {
        while (!done) {
            try {
                fifo->write({77});
            } catch (const std::runtime_error&) {
                ++refused;
            }
        }
    });
    beginMeasuring();
    helpers.threads = 2;
    EXPECT_TRUE(waitForCalls(Function::adjustTime, 3));
    EXPECT_TRUE(waitUntil([&, before = refused.load()] { return refused > before; }));
    expectStopWithin({});
    done = true;
    writer.join();
    EXPECT_EQ(epochs().at(2), 77);
    expectNoError();
}

TEST_F(EpochFifoFaultTest, OctetByOctetNeverMakesAValue) {
    fifo.emplace();
    onEachPoll([this](int) { fifo->writeOctets("x"); });
    beginMeasuring();
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 9));
    EXPECT_THAT(epochs(), Each(0));
    EXPECT_EQ(fifo->queued(), 0);
    expectNoError();
    expectStopWithin({});
}

} // namespace
