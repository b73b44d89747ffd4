#include "Failure.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::HasSubstr;

namespace {

/// A run that lasted long enough, without time pairs.
RunFacts inVain() {
    RunFacts facts;
    facts.seconds = 13.1;
    facts.patience = 13;
    facts.fifo = "/tmp/epoch";
    return facts;
}

std::string causeOf(const RunFacts& facts) {
    const auto failure = failureOf(facts);
    EXPECT_TRUE(!failure || !failure->mend.empty());
    return failure ? failure->cause : "";
}

} // namespace

TEST(Failure, TimeForAPairDependsOnTheAnnounceInterval) {
    EXPECT_EQ(patienceFor(Json{{"logAnnounceInterval", 1}}), 13);
    EXPECT_EQ(patienceFor(Json{{"logAnnounceInterval", -2}}), 6);
    EXPECT_EQ(patienceFor(Json{{"logAnnounceInterval", "x"}}), 13);
    EXPECT_EQ(patienceFor(Json::object()), 13);
}

TEST(Failure, ARunTooShortForAPairIsNone) {
    auto facts = inVain();
    facts.seconds = 13;
    EXPECT_EQ(causeOf(facts), "");
}

TEST(Failure, WithoutPairsTheCauseIsWhatWasSeenLast) {
    auto facts = inVain();
    EXPECT_EQ(causeOf(facts), "no time pair came: ptp4l does not answer");
    facts.tally.hasPorts = true;
    EXPECT_EQ(causeOf(facts), "no time pair came: no grandmaster was heard");
    facts.tally.wasUsable = true;
    EXPECT_EQ(causeOf(facts),
              "no time pair came: a grandmaster is there, its Syncs are not measured");
    facts.tally.hasPorts = false;
    facts.fifoIsThere = false;
    EXPECT_EQ(causeOf(facts), "no time pair came: there is no epoch FIFO /tmp/epoch");
}

TEST(Failure, APairIsEnough) {
    auto facts = inVain();
    facts.tally.offsets.add(0);
    EXPECT_EQ(causeOf(facts), "");
}

TEST(Failure, OffsetsThatAreAllExactlyZeroMeasureNoDelay) {
    auto facts = inVain();
    for (int i = 0; i < 54; ++i) {
        facts.tally.offsets.add(0);
    }
    EXPECT_EQ(causeOf(facts),
              "offset exactly 0 in 54 of 54 pairs: no delay is measured: delayMechanism?");
    facts.tally.offsets.add(1);
    EXPECT_EQ(causeOf(facts), "");
}

TEST(Failure, OffsetsThatAreAllTheEpochOffsetMeasureNoDelay) {
    auto facts = inVain();
    for (int i = 0; i < 20; ++i) {
        EXPECT_EQ(causeOf(facts).substr(0, 6), i == 0 ? "no tim" : "");
        facts.tally.offsets.add(37000000000);
    }
    EXPECT_EQ(causeOf(facts), "offset exactly 37000000000 ns in 20 of 20 pairs: no delay is "
                              "measured: delayMechanism?");
}

TEST(Failure, AChronydThatTookNothingIsOne) {
    auto facts = inVain();
    facts.tally.offsets.add(5);
    facts.chronyFailure = "does not take the pairs: gone; 0 sent, 1 failed";
    EXPECT_EQ(causeOf(facts), "chronyd does not take the pairs: gone; 0 sent, 1 failed");
}

TEST(Failure, TheEndOfTheDaemonExplainsAllElse) {
    auto facts = inVain();
    facts.seconds = 0;
    facts.daemonEnd = "ptp4l, process 7, ended with status 255, without a word";
    facts.chronyFailure = "does not take the pairs";
    EXPECT_EQ(causeOf(facts), facts.daemonEnd);
    EXPECT_THAT(failureOf(facts)->mend, HasSubstr("vantel-host check"));
    facts.tally.wasUsable = true;
    EXPECT_THAT(failureOf(facts)->mend, HasSubstr("the system's log"));
    facts.daemonMend = "install it";
    EXPECT_EQ(failureOf(facts)->mend, "install it");
}
