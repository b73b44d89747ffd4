#include "Health.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::HasSubstr;

namespace {

constexpr char waiting[] = "Waiting for ptp4l status";
constexpr char role[] = "PTP role has changed.";
constexpr char noAnswer[] =
    "Unable to communicate with PTP sub process while attempting to retrieve time data";
constexpr char daemonDied[] = "PTP sub process has died unexpectedly";

constexpr double usableQuality[] = {2.5e-08, 1e-06, -1.0};
constexpr double unusableQuality[] = {-2.0, -2.0, -1.0};
constexpr double otherQuality[] = {1.0, 2.0, 3.0};

Event initialisedWith(int logAnnounceInterval = 1) {
    return {"initialised", "", {{"configuration", {{"logAnnounceInterval", logAnnounceInterval}}}}};
}

/// A session that was initialised at second 100.
class HealthTest : public testing::Test {
protected:
    void SetUp() override { watch.take(initialisedWith(), 100); }

    void take(const Event& event, double seconds) { watch.take(event, seconds); }
    void take(PairKind pair, double seconds) { watch.pair(pair, seconds); }

    void takePairs(double begin, double end, double interval) {
        for (double time = begin; time <= end; time += interval) {
            take(PairKind::measured, time);
        }
    }

    /// The word.
    std::string at(double seconds) {
        watch.change(seconds);
        return nameOf(watch.standing(seconds).health.state);
    }

    std::string reasonAt(double seconds) {
        watch.change(seconds);
        return watch.standing(seconds).health.reason;
    }

    HealthWatch watch;
};

} // namespace

struct HealthRow {
    const char* name;
    HealthFacts facts;
    double now;
    HealthState state;
    const char* reason; ///< a part of it
};

class HealthTableTest : public testing::TestWithParam<HealthRow> {};

TEST_P(HealthTableTest, Row) {
    const Health health = healthOf(GetParam().facts, GetParam().now);
    EXPECT_STREQ(nameOf(health.state), nameOf(GetParam().state));
    EXPECT_THAT(health.reason, HasSubstr(GetParam().reason));
}

namespace {

HealthFacts factsOf(const char* quality, const char* reason) {
    HealthFacts facts;
    facts.begin = 100;
    facts.quality = quality;
    facts.reason = reason;
    facts.wasUsable = facts.quality == "usable";
    facts.usableSince = 110;
    return facts;
}

HealthFacts withPairs(HealthFacts facts, double last, bool measured = true,
                      double syncInterval = 0.125) {
    facts.pairs = 3;
    facts.pairTime = last;
    facts.pairIsMeasured = measured;
    facts.syncInterval = syncInterval;
    return facts;
}

HealthFacts afterUsable(HealthFacts facts) {
    facts.wasUsable = true;
    return facts;
}

HealthFacts ended(HealthFacts facts) {
    facts.daemonEnd = "ptp4l, process 7, ended with status 3";
    return facts;
}

HealthFacts stopped(HealthFacts facts) {
    facts.stopCause = "SIGTERM";
    return facts;
}

using State = HealthState;
const HealthRow healthRows[] = {
    {"NoQualityYet", factsOf("", ""), 101, State::starting, "no quality yet"},
    {"NoQualityAndNoPatienceLeft", factsOf("", ""), 114, State::lost, "no quality yet"},
    {"WaitingForTheDaemon", factsOf("unusable", waiting), 113, State::starting, waiting},
    {"WaitingForTheDaemonTooLong", factsOf("unusable", waiting), 113.1, State::lost, waiting},
    {"TheFirstPollFailed", factsOf("unusable", noAnswer), 103, State::starting, noAnswer},
    {"UsableAndTheFirstPairIsAwaited", factsOf("usable", role), 113, State::starting, "awaited"},
    {"UsableAndTheFirstPairDoesNotCome", factsOf("usable", role), 113.1, State::stale, "3.0 s"},
    {"UsableWithPairs", withPairs(factsOf("usable", role), 120), 120.1, State::locked, "arrive"},
    {"OnePairIsLate", withPairs(factsOf("usable", role), 120), 121, State::locked, "arrive"},
    {"PairsStayAway", withPairs(factsOf("usable", role), 120), 121.1, State::stale, "1.0 s"},
    {"OfASlowSyncOnePairIsLate", withPairs(factsOf("usable", role), 120, true, 4), 132,
     State::locked, "arrive"},
    {"OfASlowSyncPairsStayAway", withPairs(factsOf("usable", role), 120, true, 4), 132.1,
     State::stale, "12.0 s"},
    {"AllOffsetsAreTheSame", withPairs(factsOf("usable", role), 120, false), 120.1,
     State::unmeasured, "knows no delay"},
    {"AllOffsetsWereTheSameAndPairsStayAway", withPairs(factsOf("usable", role), 120, false), 121.1,
     State::stale, "1.0 s"},
    {"PairsThoughAPollFailed", withPairs(factsOf("unusable", noAnswer), 120), 120.5,
     State::recovered, "next change of role"},
    {"PairsThoughAPollFailedStayAway", withPairs(afterUsable(factsOf("unusable", noAnswer)), 120),
     121.1, State::lost, noAnswer},
    {"APollFailed", afterUsable(factsOf("unusable", noAnswer)), 111, State::lost, noAnswer},
    {"TheGrandmasterIsGone", afterUsable(factsOf("unusable", role)), 111, State::lost,
     "no grandmaster"},
    {"PairsAfterTheGrandmasterIsGone", withPairs(afterUsable(factsOf("unusable", role)), 120), 120,
     State::lost, "no grandmaster"},
    {"AQualityThatIsNeither", afterUsable(factsOf("other", "odd")), 111, State::lost, "odd"},
    {"TheDaemonHasEnded", ended(withPairs(factsOf("usable", role), 120)), 120, State::dead,
     "status 3"},
    {"TheDaemonHasEndedWhileStarting", ended(factsOf("", "")), 101, State::dead, "status 3"},
    {"StoppingIsAboveAll", stopped(ended(factsOf("unusable", daemonDied))), 120, State::stopping,
     "SIGTERM"},
    {"StoppingALockedClock", stopped(withPairs(factsOf("usable", role), 120)), 120, State::stopping,
     "SIGTERM"},
};

} // namespace

INSTANTIATE_TEST_SUITE_P(Health, HealthTableTest, testing::ValuesIn(healthRows),
                         [](const auto& info) { return info.param.name; });

TEST_F(HealthTest, AGoodStartIsTold) {
    take(qualityEvent(unusableQuality, waiting), 100.1);
    EXPECT_EQ(at(101), "starting");
    take(qualityEvent(usableQuality, role), 105);
    take(PairKind::falseOffset, 105.1);
    EXPECT_EQ(at(105.1), "unmeasured");
    take(PairKind::measured, 105.2);
    EXPECT_EQ(at(105.2), "locked");
}

TEST_F(HealthTest, AChangeIsAnEventWithTheTimeSpentBefore) {
    take(qualityEvent(usableQuality, role), 105);
    take(PairKind::measured, 105.1);
    const auto first = watch.change(105.1);
    ASSERT_TRUE(first);
    EXPECT_EQ(first->name, "health");
    EXPECT_EQ(first->members["state"], "locked");
    EXPECT_EQ(first->members["reason"], "time pairs arrive");
    EXPECT_EQ(first->members["before"], "starting");
    EXPECT_EQ(first->members["spent"], 105.1);
    EXPECT_FALSE(watch.change(105.2));
    const auto second = watch.change(108.5);
    ASSERT_TRUE(second);
    EXPECT_EQ(second->members["state"], "stale");
    EXPECT_EQ(second->members["before"], "locked");
    EXPECT_EQ(second->members["spent"], 3.4);
    EXPECT_EQ(watch.standing(109).seconds, 0.5);
}

TEST_F(HealthTest, TheSyncIntervalIsLearntFromThePairs) {
    take(qualityEvent(usableQuality, role), 105);
    takePairs(106, 138, 4);
    EXPECT_EQ(at(149), "locked");
    EXPECT_EQ(at(150.5), "stale");
}

TEST_F(HealthTest, AnOutageIsNotLearnt) {
    take(qualityEvent(usableQuality, role), 105);
    takePairs(106, 110, 0.125);
    EXPECT_EQ(at(150), "stale");
    takePairs(170, 170.5, 0.125);
    EXPECT_EQ(at(170.6), "locked");
    EXPECT_EQ(at(171.7), "stale");
}

TEST_F(HealthTest, ThePairOf1970IsNone) {
    take(qualityEvent(usableQuality, role), 105);
    take(PairKind::of1970, 106);
    EXPECT_EQ(at(106), "starting");
    EXPECT_EQ(at(108.1), "stale");
}

TEST_F(HealthTest, OnlyPairsWithoutADelayMeasureNothing) {
    take(qualityEvent(usableQuality, role), 105);
    for (const PairKind kind : {PairKind::afterReturn, PairKind::repeated, PairKind::jump}) {
        take(kind, 105.1);
        EXPECT_EQ(at(105.1), "locked");
    }
    take(PairKind::falseOffset, 105.2);
    EXPECT_EQ(at(105.2), "unmeasured");
}

TEST_F(HealthTest, ARepeatedUsableQualityBeginsNothingAnew) {
    take(qualityEvent(usableQuality, role), 105);
    take(qualityEvent(usableQuality, role), 107.9);
    EXPECT_EQ(at(108.1), "stale");
}

TEST_F(HealthTest, EveryFailedPollAsksForNewPairs) {
    take(qualityEvent(usableQuality, role), 105);
    takePairs(106, 110, 0.125);
    take(qualityEvent(unusableQuality, noAnswer), 112);
    EXPECT_EQ(at(112), "lost");
    take(PairKind::measured, 112.5);
    EXPECT_EQ(at(112.5), "recovered");
    take(qualityEvent(unusableQuality, noAnswer), 112.6);
    EXPECT_EQ(at(112.6), "lost");
    take(PairKind::measured, 112.9);
    EXPECT_EQ(at(112.9), "recovered");
    take(qualityEvent(usableQuality, role), 113);
    take(PairKind::measured, 113.1);
    EXPECT_EQ(at(113.1), "locked");
}

TEST_F(HealthTest, ThePlugInsWordForADeadDaemonIsEnough) {
    take(qualityEvent(unusableQuality, daemonDied), 105);
    EXPECT_EQ(at(105), "dead");
    EXPECT_EQ(reasonAt(105), daemonDied);
    take(qualityEvent(unusableQuality, noAnswer), 106);
    EXPECT_EQ(at(106), "dead");
}

TEST_F(HealthTest, ARestartIsNoStopAndBeginsAnew) {
    take(qualityEvent(usableQuality, role), 105);
    take(daemonEndedEvent({7, false, 3}, {}), 106);
    take(stoppingEvent("restart"), 106);
    EXPECT_EQ(at(107), "dead");
    take(initialisedWith(), 110);
    EXPECT_EQ(at(122.9), "starting");
    EXPECT_EQ(at(123.1), "lost");
}

TEST_F(HealthTest, PatienceGrowsWithTheAnnounceInterval) {
    take(initialisedWith(3), 200);
    EXPECT_EQ(at(236.9), "starting");
    EXPECT_EQ(at(237.1), "lost");
}

TEST_F(HealthTest, WhatIsExpectedOfAStopChangesNothing) {
    take(qualityEvent(usableQuality, role), 105);
    take(PairKind::measured, 105.1);
    take(expectedEvent(qualityEvent(otherQuality, daemonDied)), 105.2);
    EXPECT_EQ(at(105.2), "locked");
    take(stoppingEvent("SIGINT"), 105.3);
    EXPECT_EQ(at(105.3), "stopping");
    EXPECT_EQ(reasonAt(105.3), "SIGINT");
}
