// What chronyd gets of a run, with the plug-in itself and the simulated ptp4l.

#include <algorithm>
#include <csignal>

#include "ListeningChronyd.h"
#include "Tool.h"
#include "support/SimulatedRun.h"

using vantelhost::Json;

namespace {

class ToolChronyTest : public testing::Test {
protected:
    /// Runs until so many pairs have come.
    /// @param script for the simulated ptp4l
    void runFor(int pairs, const std::string& script) {
        SimulatedRun run(folder.path("run" + std::to_string(++runs)), script, {"--chrony", socket});
        Child& host = run.host();
        for (int i = 1; i <= pairs; ++i) {
            ASSERT_TRUE(host.waitForOutput("\"event\":\"pair\"", i)) << host.errors();
            chronyd.read();
        }
        host.signal(SIGTERM);
        EXPECT_EQ(host.wait(), 0);
        result = {0, host.output(), host.errors()};
    }

    std::size_t leftOut(const std::string& word) const {
        const auto pairs = result.events("pair");
        return static_cast<std::size_t>(
            std::count_if(pairs.begin(), pairs.end(),
                          [&](const Json& pair) { return pair.value("leftOut", "") == word; }));
    }

    /// Of the last pair before the run was ended.
    std::string lastJudgement() const {
        std::string last;
        for (const auto& pair : result.events("pair")) {
            const std::string each = pair.value("leftOut", "");
            last = each == "health" ? last : each;
        }
        return last;
    }

    Folder folder;
    const std::string socket = folder.path("chrony.sock");
    ListeningChronyd chronyd{socket};
    int runs = 0;
    Result result;
};

constexpr double tolerance = 1e-6;

} // namespace

TEST_F(ToolChronyTest, GetsThePairsThatMeasureSomething) {
    runFor(20, "offset 250\njitter 50\ngm-after 1\nsyncs-before-delay 8\n");
    const auto offsets = chronyd.takeOffsets();
    EXPECT_THAT(offsets, testing::Each(testing::DoubleNear(-250e-9, 60e-9)));
    EXPECT_GE(leftOut("no-delay"), 1U);
    EXPECT_EQ(offsets.size(), leftOut(""));
    EXPECT_EQ(result.events("chrony").back()["sent"], offsets.size());
}

/// The clock steps by a second, and back: as when reference and clock take a leap second one after
/// the other.
TEST_F(ToolChronyTest, GetsNoSampleThatIsASecondOff) {
    for (const char* const step : {"-1", "1"}) {
        const std::string back = step[0] == '-' ? step + 1 : std::string("-") + step;
        runFor(45, std::string("offset 250\njitter 50\n") +
                       "on TIME_STATUS_NP after 15 times 1 do clock-step " + step + "\n" +
                       "on TIME_STATUS_NP after 30 times 1 do clock-step " + back + "\n");
        const auto offsets = chronyd.takeOffsets();
        EXPECT_THAT(offsets, testing::Each(testing::DoubleNear(0, tolerance)));
        EXPECT_EQ(offsets.size(), leftOut(""));
        EXPECT_GT(leftOut("jump"), 5U);
        EXPECT_EQ(lastJudgement(), "");
    }
}

TEST_F(ToolChronyTest, GetsAStepOfTheClockOnceItIsConfirmed) {
    runFor(40, "offset 250\njitter 50\non TIME_STATUS_NP after 30 times 1 do clock-step 0.3\n");
    const auto offsets = chronyd.takeOffsets();
    EXPECT_THAT(offsets, testing::Contains(testing::DoubleNear(-0.3, tolerance)));
    EXPECT_EQ(leftOut("jump"), 1U);
    EXPECT_EQ(offsets.size(), leftOut(""));
}

TEST_F(ToolChronyTest, GetsNothingOfAFrozenClock) {
    runFor(30, "offset 250\ngm-after 1\nsyncs-before-delay 8\n");
    EXPECT_EQ(chronyd.takeOffsets().size(), 7U);
    EXPECT_GE(leftOut("same"), 10U);
    EXPECT_EQ(result.events("health").back()["before"], "locked");
}
