// Clocks that jump: the host's, and the daemon's.

#include <array>
#include <chrono>

#include <gmock/gmock.h>

#include "FaultTest.h"
#include "Interposed.h"

namespace {

using std::chrono::milliseconds;
using testing::ElementsAre;

constexpr std::uint64_t ingressTime = 1700000000000000000;
constexpr std::uint64_t hour = 3600000000000;

class ClockFaultTest : public FaultTest {
protected:
    std::vector<std::pair<std::uint64_t, std::uint64_t>> pairs() const {
        std::vector<std::pair<std::uint64_t, std::uint64_t>> all;
        for (const auto& call : host.calls(Function::adjustTime)) {
            all.emplace_back(call.referenceTime, call.localTime);
        }
        return all;
    }

    /// Expects that each sleep was of 16 to 125 ms.
    static void expectSleepsWithinBounds() {
        EXPECT_GE(sleepsOfWorker().shortest, milliseconds(16));
        EXPECT_EQ(sleepsOfWorker().longest, milliseconds(125));
    }
};

TEST_F(ClockFaultTest, OfTheHostMayJump) {
    static constexpr std::array<std::uint64_t, 8> times = {
        ingressTime + 120000000,     ingressTime + hour,
        ingressTime - hour,          0,
        0xFFFFFFFFFFFFFFFF,          ingressTime + 4294967296000,
        ingressTime - 4294967296000, ingressTime + 100000000};
    onEachPoll([this](int poll) { host.setTime(times[static_cast<std::size_t>(poll) % 8]); });
    begin("clock fixed 1700000000000000000\noffset 250\nsyncs-before-delay 0\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 25));
    expectSleepsWithinBounds();
    EXPECT_THAT(pairs(), ElementsAre(std::pair(ingressTime - 250, ingressTime)));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable));
    EXPECT_EQ(metaData().size(), 2U);
    expectStopWithin({});
}

TEST_F(ClockFaultTest, OfTheDaemonMayJump) {
    host.setTime(ingressTime + 112000000);
    begin("clock fixed 1700000000000000000\n"
          "offset 250\n"
          "syncs-before-delay 0\n"
          "on TIME_STATUS_NP after 2 times 1 do clock-step 3600\n"
          "on TIME_STATUS_NP after 4 times 1 do clock-step -7200\n"
          "on TIME_STATUS_NP after 6 times 1 do clock-step -1\n");
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 4));
    ASSERT_TRUE(waitForCalls(Function::getTime, 10));
    expectSleepsWithinBounds();
    // The reference stays; what moves is the local clock.
    constexpr std::uint64_t reference = 1699999999999999750;
    EXPECT_THAT(pairs(), ElementsAre(std::pair(reference, 1700000000000000000),
                                     std::pair(reference, 1700003600000000000),
                                     std::pair(reference, 1699996400000000000),
                                     std::pair(reference, 1699996399000000000)));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable));
    EXPECT_EQ(metaData().size(), 2U);
    expectStopWithin({});
}

} // namespace
