// A run from loading to the summary.

#include <sstream>

#include "Tool.h"

using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;
using vantelhost::Json;

namespace {

std::vector<std::string> namesOf(const std::vector<Json>& events) {
    std::vector<std::string> names;
    for (const auto& event : events) {
        names.push_back(event["event"]);
    }
    return names;
}

} // namespace

TEST_F(ToolTest, ACleanRunTellsEachStepAndEndsWithStatus0) {
    const auto result = play("");
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.errors, "");
    EXPECT_THAT(namesOf(result.events()), ElementsAre("loaded", "initialised", "started",
                                                      "stopping", "health", "stopped", "summary"));
    EXPECT_THAT(record(), ElementsAre(StartsWith("initialise {"), "blocked yes", "start", "stop",
                                      "finalise"));
}

TEST_F(ToolTest, LoadedTellsNameAndVersion) {
    const auto loaded = play("").events("loaded");
    ASSERT_EQ(loaded.size(), 1U);
    EXPECT_EQ(loaded[0]["name"], "Fake time referen");
    EXPECT_EQ(loaded[0]["apiVersion"], 2);
    EXPECT_EQ(loaded[0]["library"], FAKE_PLUGIN);
}

TEST_F(ToolTest, DefaultsAreCompletedFromTheSchema) {
    ASSERT_EQ(play("").status, 0);
    const Json expected{{"count", 7},
                        {"wide", 4294967295U},
                        {"twoStep", false},
                        {"script", ""},
                        {"record", folder.path("record")},
                        {"fifo", ""},
                        {"interface", Json::array({"eth0"})}};
    EXPECT_EQ(configuration().dump(), expected.dump());
}

TEST_F(ToolTest, QualityIsShownWithValuesAndReason) {
    const auto result = play("quality");
    EXPECT_EQ(result.status, 0);
    const auto events = result.events("quality");
    ASSERT_EQ(events.size(), 3U);
    EXPECT_EQ(events[0]["quality"], "unusable");
    EXPECT_EQ(events[0]["reason"], "Waiting");
    EXPECT_EQ(events[1]["quality"], "usable");
    EXPECT_EQ(events[1]["reason"], "role\nchanged \x01\xEF\xBF\xBD.");
    EXPECT_EQ(events[2]["quality"], "other");
    EXPECT_EQ(events[2]["values"], Json({1.0, 2.0, 3.0}));
}

TEST_F(ToolTest, PairsAreShownWithTheirOffsetAndSummedUp) {
    const auto result = play("pairs");
    const auto pairs = result.events("pair");
    ASSERT_EQ(pairs.size(), 3U);
    EXPECT_EQ(pairs[0]["reference"], 1000);
    EXPECT_EQ(pairs[0]["local"], 990);
    EXPECT_EQ(pairs[0]["offset"], -10);
    EXPECT_EQ(pairs[2]["offset"], 2);
    const Json summary = result.events("summary").at(0);
    EXPECT_EQ(summary["pairs"], 3);
    EXPECT_EQ(summary["offset"]["min"], -10);
    EXPECT_EQ(summary["offset"]["max"], 30);
    EXPECT_NEAR(summary["offset"]["mean"].get<double>(), 22.0 / 3, 1e-9);
    EXPECT_NEAR(summary["offset"]["rms"].get<double>(), 18.2939, 1e-4);
}

TEST_F(ToolTest, MetadataIsAJsonObjectOfTheEvent) {
    const auto events = play("metadata").events("metadata");
    ASSERT_EQ(events.size(), 1U);
    EXPECT_EQ(events[0]["valid"], true);
    EXPECT_EQ(events[0]["metadata"]["Port1"]["portState"], "PTP_SLAVE");
}

TEST_F(ToolTest, ReadableLinesTellTheSame) {
    const auto result = run({"--interface", "eth0", "--seconds", "0", "--set",
                             "script=quality pairs metadata bad-metadata"});
    EXPECT_EQ(result.status, 1);
    for (const char* text :
         {"loaded       \"Fake time referen\", API version 2", "initialised  interface [\"eth0\"]",
          "started\n", "quality      unusable [-2, -2, -1] Waiting",
          "quality      usable [2.5e-08, 1e-06, -1] role\\x0Achanged",
          "quality      other [1, 2, 3] odd", "pair         reference 1000 local 990 offset -10 ns",
          "metadata     grandmaster 00:1B:21:FF:FE:0A:0B:0C class 6 WITHIN_100NS; Port1 PTP_SLAVE "
          "on eth0",
          "metadata     invalid, not a JSON object: {\"gmClockId\":", "stopping     duration\n",
          "stopped\n",
          "3 pairs, 3 left out, 3 quality changes, 1 metadata updates, 1 errors, offset min -10"}) {
        EXPECT_THAT(result.output, HasSubstr(text));
    }
    std::istringstream lines(result.output);
    for (std::string line; std::getline(lines, line);) {
        EXPECT_THAT(line, testing::MatchesRegex(" *[0-9]+\\.[0-9]+ [a-z]+.*"));
    }
}

TEST_F(ToolTest, TheHostsTimeReachesThePlugIn) {
    const auto result = play("time");
    EXPECT_EQ(result.events("summary").at(0)["timeRequests"], 1);
    EXPECT_THAT(record(), testing::Contains(testing::MatchesRegex("time [0-9]{19}")));
}

TEST_F(ToolTest, ConcurrentCallsAreAllTakenInWholeLines) {
    const auto result = play("concurrent");
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("pair").size(), 500U);
    EXPECT_EQ(result.events("metadata").size(), 500U);
    const Json summary = result.events("summary").at(0);
    EXPECT_EQ(summary["pairs"], 500);
    EXPECT_EQ(summary["timeRequests"], 500);
    EXPECT_EQ(summary["offset"]["rms"], 5.0);
}

TEST_F(ToolTest, TheRunEndsAfterItsDuration) {
    const auto result = run({"--json", "--interface", "eth0", "--seconds", "0.3"});
    EXPECT_EQ(result.status, 0);
    const double started = result.events("started").at(0)["t"];
    const Json stopping = result.events("stopping").at(0);
    EXPECT_EQ(stopping["cause"], "duration");
    EXPECT_GE(stopping["t"].get<double>() - started, 0.299);
}

TEST_F(ToolTest, CallsDuringTheStopAreTaken) {
    const auto result = play("late");
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("quality").size(), 1U);
    EXPECT_THAT(record(), testing::Contains("answer quality 0 -"));
}

TEST_F(ToolTest, CallsDuringTheStopAreRefusedIfAskedFor) {
    const auto result = play("late", {"--refuse-while-stopping"});
    EXPECT_EQ(result.status, 0);
    EXPECT_TRUE(result.events("quality").empty());
    EXPECT_EQ(result.events("refused").at(0)["function"], "zekel_setTRQuality");
    EXPECT_EQ(result.events("summary").at(0)["refused"], 1);
    EXPECT_THAT(record(), testing::Contains(StartsWith("answer quality -52009 {")));
}
