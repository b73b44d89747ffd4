// Runs on a PTP clock: the program is linked with a stand-in for its device.

#include <algorithm>
#include <cmath>
#include <csignal>
#include <cstdlib>
#include <sstream>

#include "ListeningChronyd.h"
#include "Moment.h"
#include "SockSample.h"
#include "TaiOffset.h"
#include "Tool.h"
#include "support/PtpDevice.h"
#include "support/SimulatedRun.h"

using testing::ElementsAre;
using testing::HasSubstr;
using vantelhost::Json;

namespace {

constexpr std::int64_t nicAhead = 37000000000;
constexpr std::int64_t interval = 125000000;

class ToolClockTest : public ToolTest {
protected:
    ToolClockTest() { writePtpDevice(device, {nicAhead, PtpDevice::Best::extended, 0}); }

    /// Runs with a grandmaster that keeps TAI until so many pairs have come.
    /// @return the exit status.
    int runOnTai(int pairs, const std::string& taiOffset) {
        SimulatedRun run(folder.path("run"), "clock-offset 37\noffset 250\njitter 50\n",
                         {"--clock", device, "--chrony", socket, "--tai-offset", taiOffset});
        Child& host = run.host();
        for (int i = 1; i <= pairs; ++i) {
            EXPECT_TRUE(host.waitForOutput("\"event\":\"pair\"", i)) << host.errors();
            chronyd.read();
        }
        host.signal(SIGTERM);
        const int status = host.wait();
        result = {status, host.output(), host.errors()};
        return status;
    }

    const std::string device = folder.path("ptp0");
    const std::string socket = folder.path("chrony.sock");
    ListeningChronyd chronyd{socket};
    Result result{};
};

/// The pairs in whole lines of an output.
std::vector<Json> pairsIn(const std::string& output) {
    std::vector<Json> pairs;
    std::istringstream lines(output.substr(0, output.rfind('\n') + 1));
    for (std::string line; std::getline(lines, line);) {
        if (line.compare(0, 15, R"({"event":"pair")") == 0) {
            pairs.push_back(Json::parse(line));
        }
    }
    return pairs;
}

/// How Syncs, eight a second, became pairs.
struct Polling {
    double pairsPerSync;
    double delay; ///< from a Sync to its pair, the median, in intervals of Syncs
};

Polling pollingOf(const std::vector<Json>& pairs, std::int64_t clockAhead) {
    const auto locals = [&](const Json& pair) { return pair["local"].get<std::int64_t>(); };
    std::vector<double> delays;
    for (const auto& pair : pairs) {
        const auto arrival = locals(pair) - clockAhead;
        delays.push_back(static_cast<double>(pair["time"].get<std::int64_t>() - arrival) /
                         static_cast<double>(interval));
    }
    std::sort(delays.begin(), delays.end());
    const auto syncs = (locals(pairs.back()) - locals(pairs.front())) / interval + 1;
    return {static_cast<double>(pairs.size()) / static_cast<double>(syncs),
            delays[delays.size() / 2]};
}

bool isGood(const Polling& polling) {
    return polling.pairsPerSync >= 0.95 && polling.delay < 0.4;
}

} // namespace

TEST_F(ToolClockTest, ThePlugInIsAnsweredTheNamedClocksTime) {
    const auto before = vantelhost::realtimeNanoseconds() + nicAhead;
    const auto result = play("time", {"--clock", device});
    EXPECT_EQ(result.status, 0) << result.errors;
    const auto lines = record();
    const auto line = std::find_if(lines.begin(), lines.end(),
                                   [](const auto& each) { return each.find("time ") == 0; });
    ASSERT_NE(line, lines.end());
    const auto time = std::stoull(line->substr(5));
    EXPECT_GE(time, before);
    EXPECT_LE(time, vantelhost::realtimeNanoseconds() + nicAhead);
}

TEST_F(ToolClockTest, TheNamedClockIsToldBeforeTheSession) {
    const auto events = play("", {"--clock", device}).events();
    ASSERT_GE(events.size(), 3U);
    EXPECT_EQ(events[1]["event"], "clock");
    EXPECT_EQ(events[1]["clock"], device);
    EXPECT_EQ(events[1]["problem"], "");
    EXPECT_EQ(events[1]["refused"], 0);
    EXPECT_EQ(events[2]["event"], "initialised");
}

TEST_F(ToolClockTest, PairsTellTheirTimeInTheSystemsClockAndHowCertainThatIs) {
    const auto pairs = play("timely", {"--clock", device}).events("pair");
    ASSERT_EQ(pairs.size(), 3U);
    for (const auto& pair : pairs) {
        const auto local = pair["local"].get<std::int64_t>();
        const auto wrong = local - nicAhead - pair["realtime"].get<std::int64_t>();
        EXPECT_LE(std::abs(wrong), pair["uncertainty"].get<std::int64_t>());
        EXPECT_GE(pair["uncertainty"], 150);
    }
}

TEST_F(ToolClockTest, ChronydGetsTheSystemsTimeAndTheReferenceOnUtc) {
    const auto result =
        play("role timely", {"--clock", device, "--tai-offset", "37", "--chrony", socket});
    EXPECT_EQ(result.status, 0) << result.output;
    const auto pairs = result.events("pair");
    ASSERT_EQ(pairs.size(), 3U);
    for (const auto& pair : pairs) {
        const auto realtime = pair["realtime"].get<std::uint64_t>();
        const auto utc = pair["reference"].get<std::uint64_t>() - nicAhead;
        EXPECT_EQ(chronyd.receive(), vantelhost::sockSample(utc, realtime));
    }
}

TEST_F(ToolClockTest, PairsOfAnotherClockAreNotChronyds) {
    const auto result = play("role pairs", {"--clock", device, "--chrony", socket});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(chronyd.receive(), "");
}

TEST_F(ToolClockTest, OnRealtimePairsTellNoOtherTime) {
    const auto result = play("timely", {"--clock", "realtime"});
    EXPECT_EQ(result.status, 0) << result.output;
    EXPECT_FALSE(result.events("pair").at(0).contains("realtime"));
    EXPECT_EQ(result.events("clock").at(0)["clock"], "CLOCK_REALTIME");
}

TEST_F(ToolClockTest, PairsOfAnotherClockAreAnErrorOnceAndCounted) {
    const auto result = play("pairs", {"--clock", device});
    EXPECT_EQ(result.status, 1);
    ASSERT_EQ(result.events("error").size(), 1U);
    EXPECT_EQ(result.events("error")[0]["operation"], "clock");
    EXPECT_THAT(result.events("error")[0]["problem"].get<std::string>(),
                HasSubstr("990 ns, is not of " + device));
    EXPECT_EQ(result.events("clock").back()["refused"], 3);
    EXPECT_FALSE(result.events("pair").at(0).contains("realtime"));
}

TEST_F(ToolClockTest, AClockThatIsNoneIsABadOption) {
    for (const std::string& name : {folder.path("none"), std::string("ptp0")}) {
        const auto result = play("", {"--clock", name});
        EXPECT_EQ(result.status, 2);
        EXPECT_THAT(result.errors, HasSubstr(name));
        EXPECT_TRUE(record().empty());
    }
}

TEST_F(ToolClockTest, OfAGrandmasterThatKeepsTaiChronydGetsUtc) {
    EXPECT_EQ(runOnTai(12, "37"), 0) << result.output;
    const auto offsets = chronyd.takeOffsets();
    EXPECT_GE(offsets.size(), 5U);
    EXPECT_THAT(offsets, testing::Each(testing::DoubleNear(0, 1e-4)));
    EXPECT_EQ(result.events("chrony").back()["sent"], offsets.size());
}

TEST_F(ToolClockTest, ChronydGetsNothingOfATimescaleThatIsNotKnown) {
    if (vantelhost::kernelTaiOffset() != 0) {
        GTEST_SKIP() << "SKIPPED: the kernel knows TAI minus UTC";
    }
    EXPECT_EQ(runOnTai(12, "kernel"), 1);
    EXPECT_TRUE(chronyd.takeOffsets().empty());
    ASSERT_EQ(result.events("error").size(), 1U);
    EXPECT_EQ(result.events("error")[0]["operation"], "chronyd");
    EXPECT_THAT(result.events("error")[0]["problem"].get<std::string>(),
                HasSubstr("37.000 s ahead of this machine's, and the kernel does not know TAI "
                          "minus UTC: set the clock, or say --tai-offset 37"));
    EXPECT_GE(result.events("chrony").back()["withheld"], 5);
}

// Syncs come in the middle between polls that are 125 ms apart: pairs that are early show that the
// plug-in knows when Syncs come. A busy machine gets three tries.
TEST_F(ToolClockTest, OnAnotherTimescaleSyncsBecomePairsAsOnTheSystems) {
    constexpr int pairs = 40;
    struct {
        std::string script;
        std::string clock;
        std::int64_t ahead;
    } const kinds[] = {{"", "realtime", 0}, {"clock-offset 37\n", device, nicAhead}};
    for (const auto& kind : kinds) {
        SimulatedRun run(folder.path("run" + std::to_string(kind.ahead)),
                         kind.script + "jitter 250\nsync-interval 0.125\ngm-after 0.05\n",
                         {"--clock", kind.clock});
        Child& host = run.host();
        Polling polling{};
        for (int i = 0; i < 3 && !isGood(polling); ++i) {
            host.forgetOutput();
            ASSERT_TRUE(host.waitForOutput("\"event\":\"pair\"", pairs)) << host.errors();
            polling = pollingOf(pairsIn(host.output()), kind.ahead);
        }
        EXPECT_TRUE(isGood(polling)) << kind.clock << ": " << polling.pairsPerSync << " pairs a "
                                     << "Sync after " << polling.delay << " intervals";
        host.signal(SIGTERM);
        EXPECT_EQ(host.wait(), 0) << host.output();
    }
}
