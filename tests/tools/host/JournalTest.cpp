#include "Journal.h"

#include <array>
#include <functional>
#include <limits>
#include <optional>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "EventPrinter.h"
#include "Tool.h"

using namespace vantelhost;

namespace {

class JournalTest : public testing::Test {
protected:
    ~JournalTest() override { ::close(file); }

    std::vector<Json> events() const { return Result{0, contentOf(path), {}}.events(); }

    std::vector<Json> pairs() const { return Result{0, contentOf(path), {}}.events("pair"); }

    void becomeUsable() {
        constexpr std::array usable{2.5e-08, 1e-06, -1.0};
        journal.quality(usable.data(), "PTP role has changed.");
    }

    Folder folder;
    std::string path = folder.path("out");
    int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    int lost = 0;
    std::string reason;
    std::function<void(const std::string&)> onLost = [this](const std::string& why) {
        ++lost;
        reason = why;
    };
    Journal journal{EventPrinter(file, Format::jsonLines), onLost};
};

} // namespace

TEST_F(JournalTest, TheOffsetIsTheModuloDifferenceWithItsSign) {
    journal.pair(1000, 990);
    journal.pair(0xFFFFFFFFFFFFFFFF, 1);
    journal.pair(1, 0xFFFFFFFFFFFFFFFF);
    journal.pair(0, 0x8000000000000000);
    const auto shown = events();
    ASSERT_EQ(shown.size(), 4U);
    EXPECT_EQ(shown[0]["offset"], -10);
    EXPECT_EQ(shown[1]["offset"], 2);
    EXPECT_EQ(shown[1]["reference"], 0xFFFFFFFFFFFFFFFF);
    EXPECT_EQ(shown[2]["offset"], -2);
    EXPECT_EQ(shown[3]["offset"], std::numeric_limits<std::int64_t>::min());
    EXPECT_EQ(journal.tally().offsets.count, 4U);
}

TEST_F(JournalTest, PairsAreHandedOnWithTheirTimeInTheSystemsClock) {
    std::vector<std::uint64_t> handed;
    journal.handPairsTo([&](std::uint64_t reference, std::uint64_t local) {
        handed.insert(handed.end(), {reference, local});
        return std::nullopt;
    });
    becomeUsable();
    journal.pair(100, 90);
    journal.carryPairsBy([](std::uint64_t local) {
        return PairCarrier::Result{Carried{local + 1000, 7, true}, std::nullopt};
    });
    journal.pair(300, 250);
    EXPECT_EQ(handed, (std::vector<std::uint64_t>{100, 90, 300, 1250}));
    const auto shown = pairs();
    ASSERT_EQ(shown.size(), 2U);
    EXPECT_FALSE(shown.front().contains("realtime"));
    EXPECT_EQ(shown.back()["local"], 250);
    EXPECT_EQ(shown.back()["realtime"], 1250);
    EXPECT_EQ(shown.back()["uncertainty"], 7);
}

TEST_F(JournalTest, APairThatIsRefusedIsShownAndCountedButNotHandedOn) {
    int handed = 0;
    int asked = 0;
    journal.handPairsTo([&](std::uint64_t, std::uint64_t) {
        ++handed;
        return std::nullopt;
    });
    journal.carryPairsBy([&](std::uint64_t) {
        return PairCarrier::Result{
            std::nullopt, asked++ == 0 ? std::optional(failureEvent("clock", "no")) : std::nullopt};
    });
    becomeUsable();
    journal.pair(100, 90);
    journal.pair(300, 250);
    journal.pair(10, 0); // of 1970: of no clock
    EXPECT_EQ(handed, 0);
    EXPECT_EQ(asked, 2);
    EXPECT_EQ(journal.tally().errors, 1U);
    EXPECT_EQ(journal.tally().offsets.count, 3U);
    EXPECT_EQ(journal.tally().leftOut.count("health"), 0U) << "a clock might follow the first two";
    EXPECT_EQ(pairs().size(), 3U);
}

TEST_F(JournalTest, ARepeatedQualityIsShownButIsNoChange) {
    constexpr std::array usable{2.5e-08, 1e-06, -1.0};
    journal.quality(usable.data(), "a");
    journal.quality(usable.data(), "a");
    journal.quality(usable.data(), "b");
    EXPECT_EQ(events().size(), 3U);
    EXPECT_EQ(journal.tally().qualityChanges, 2U);
}

TEST_F(JournalTest, WhatIsExpectedIsShownAsSuchAndNotCounted) {
    constexpr std::array unusable{-2.0, -2.0, -1.0};
    journal.metadata(R"({"Port1":{}})");
    journal.quality(unusable.data(), "died", true);
    journal.metadata(R"({"a":1})", true);
    const auto shown = events();
    ASSERT_EQ(shown.size(), 3U);
    EXPECT_EQ(shown[1]["event"], "expected");
    EXPECT_EQ(shown[1]["call"], "quality");
    EXPECT_EQ(shown[1]["reason"], "died");
    EXPECT_EQ(shown[2]["call"], "metadata");
    EXPECT_EQ(shown[2]["metadata"]["a"], 1);
    EXPECT_EQ(journal.tally().qualityChanges, 0U);
    EXPECT_EQ(journal.tally().metadataUpdates, 1U);
    EXPECT_TRUE(journal.tally().hasPorts);
    journal.metadata("{", true);
    EXPECT_FALSE(journal.isClean());
}

TEST_F(JournalTest, TheTallyKnowsWhetherThereWereAUsableQualityAndPorts) {
    constexpr std::array usable{2.5e-08, 1e-06, -1.0};
    constexpr std::array unusable{-2.0, -2.0, -1.0};
    journal.quality(unusable.data(), "a");
    EXPECT_FALSE(journal.tally().wasUsable);
    journal.quality(usable.data(), "a");
    journal.quality(unusable.data(), "a");
    EXPECT_TRUE(journal.tally().wasUsable);
    journal.metadata(R"({"Port1":{}})");
    EXPECT_TRUE(journal.tally().hasPorts);
    journal.metadata(R"({"gmClockId":""})");
    EXPECT_FALSE(journal.tally().hasPorts);
}

TEST_F(JournalTest, MetadataMustBeAJsonObject) {
    journal.metadata(R"({"a":1})");
    EXPECT_TRUE(journal.isClean());
    for (const char* text : {"", "[]", "{\"a\":}", "{} x"}) {
        journal.metadata(text);
    }
    EXPECT_FALSE(journal.isClean());
    const auto shown = events();
    ASSERT_EQ(shown.size(), 5U);
    EXPECT_EQ(shown[0]["metadata"].dump(), R"({"a":1})");
    EXPECT_EQ(shown[0]["valid"], true);
    EXPECT_EQ(shown[3]["valid"], false);
    EXPECT_EQ(shown[3]["text"], "{\"a\":}");
    EXPECT_EQ(journal.tally().metadataUpdates, 1U);
    EXPECT_EQ(journal.tally().errors, 4U);
}

TEST_F(JournalTest, RefusalsAndNotesLeaveTheRunClean) {
    journal.note(startedEvent());
    journal.refusal("zekel_getTime");
    journal.timeRequest();
    EXPECT_TRUE(journal.isClean());
    journal.error(failureEvent("x", "y"));
    EXPECT_FALSE(journal.isClean());
    journal.summary();
    const auto summary = events().back();
    EXPECT_EQ(summary["errors"], 1);
    EXPECT_EQ(summary["refused"], 1);
    EXPECT_EQ(summary["timeRequests"], 1);
}

TEST_F(JournalTest, LostOutputIsToldOnceAndIsNotClean) {
    const int full = ::open("/dev/full", O_WRONLY | O_CLOEXEC);
    Journal lossy(EventPrinter(full, Format::readable), onLost);
    lossy.note(startedEvent());
    lossy.note(stoppedEvent());
    EXPECT_EQ(lost, 1);
    EXPECT_EQ(reason, "No space left on device");
    EXPECT_FALSE(lossy.isClean());
    ::close(full);
}

TEST_F(JournalTest, ARefusalNamesTheFunction) {
    journal.refusal("zekel_getTime");
    EXPECT_EQ(events().at(0)["event"], "refused");
    EXPECT_EQ(events().at(0)["function"], "zekel_getTime");
}

TEST_F(JournalTest, WhatALaterOutputTellsGoesToAllAndAnErrorIsNotClean) {
    std::vector<std::string> names;
    journal.addOutput([&](const Event& event, const Moment&) {
        names.push_back(event.name);
        return names.size() == 1   ? std::optional(failureEvent("record r", "full"))
               : names.size() == 3 ? std::optional(lostEvent("record r", 2, 0.5, "full"))
                                   : std::nullopt;
    });
    journal.note(startedEvent());
    EXPECT_FALSE(journal.isClean());
    journal.note(stoppedEvent());
    EXPECT_THAT(names, testing::ElementsAre("started", "error", "stopped", "lost"));
    const auto shown = events();
    ASSERT_EQ(shown.size(), 4U);
    EXPECT_EQ(shown[1]["operation"], "record r");
    EXPECT_EQ(shown[1]["problem"], "full");
    EXPECT_EQ(shown[3]["events"], 2);
    EXPECT_EQ(shown[3]["seconds"], 0.5);
    EXPECT_EQ(shown[3]["problem"], "full");
    EXPECT_EQ(journal.tally().errors, 1U);
    EXPECT_EQ(lost, 0);
}

TEST_F(JournalTest, ALaterOutputGetsWhatHasComeBefore) {
    journal.note(startedEvent());
    std::vector<std::string> names;
    journal.addOutput([&](const Event& event, const Moment&) {
        names.push_back(event.name);
        return std::nullopt;
    });
    journal.outputsAreComplete();
    journal.note(stoppedEvent());
    EXPECT_THAT(names, testing::ElementsAre("started", "stopped"));
    EXPECT_EQ(events().size(), 2U);
}

TEST_F(JournalTest, ALaterOutputThatCannotTakeWhatCameBeforeIsHeard) {
    journal.note(startedEvent());
    journal.addOutput([](const Event& event, const Moment&) {
        return event.name == "started" ? std::optional(failureEvent("record r", "full"))
                                       : std::nullopt;
    });
    EXPECT_FALSE(journal.isClean());
    EXPECT_EQ(events().at(1)["operation"], "record r");
    EXPECT_EQ(events().size(), 2U);
}

TEST_F(JournalTest, EveryOutputGetsTheSameMoment) {
    std::vector<Moment> moments;
    for (int i = 0; i < 2; ++i) {
        journal.addOutput([&](const Event&, const Moment& moment) {
            moments.push_back(moment);
            return std::nullopt;
        });
    }
    journal.note(startedEvent());
    ASSERT_EQ(moments.size(), 2U);
    EXPECT_EQ(moments[0].seconds, moments[1].seconds);
    EXPECT_EQ(moments[0].realtime, moments[1].realtime);
    EXPECT_EQ(events().at(0)["time"], moments[0].realtime);
}

TEST_F(JournalTest, WhatThePairTakerTellsFollowsThePair) {
    journal.handPairsTo([](std::uint64_t reference, std::uint64_t local) {
        return local == 3 ? std::optional(chronyEvent({reference, local, 0}, "")) : std::nullopt;
    });
    becomeUsable();
    journal.pair(0, 1);
    journal.pair(1, 3);
    const auto shown = events();
    ASSERT_EQ(shown.size(), 5U);
    EXPECT_EQ(shown[1]["event"], "pair");
    EXPECT_EQ(shown[2]["event"], "health");
    EXPECT_EQ(shown[3]["event"], "pair");
    EXPECT_EQ(shown[4]["event"], "chrony");
    EXPECT_EQ(shown[4]["sent"], 1);
}

TEST_F(JournalTest, AnErrorOfThePairTakerIsNotClean) {
    journal.handPairsTo([](std::uint64_t, std::uint64_t) { return failureEvent("chronyd", "p"); });
    becomeUsable();
    journal.pair(0, 1);
    EXPECT_FALSE(journal.isClean());
    EXPECT_EQ(events().back()["problem"], "p");
}

TEST_F(JournalTest, OnlyPairsThatAClockMayFollowAreHandedOn) {
    std::vector<std::uint64_t> handedOn;
    journal.handPairsTo([&](std::uint64_t, std::uint64_t local) {
        handedOn.push_back(local);
        return std::nullopt;
    });
    becomeUsable();
    journal.pair(200, 200); // the offset of before
    journal.pair(300, 302); // the first good one
    journal.pair(400, 500000400);
    constexpr std::array unusable{-2.0, -2.0, -1.0};
    journal.quality(unusable.data(), "Unable to communicate with PTP sub process while "
                                     "attempting to retrieve time data");
    journal.pair(500, 503);
    journal.pair(600, 602); // the health has recovered
    journal.quality(unusable.data(), "PTP role has changed.");
    journal.pair(700, 703);
    std::vector<std::string> leftOut;
    for (const auto& pair : pairs()) {
        leftOut.push_back(pair.value("leftOut", ""));
    }
    EXPECT_THAT(leftOut, testing::ElementsAre("no-delay", "", "jump", "", "", "health"));
    EXPECT_THAT(handedOn, testing::ElementsAre(302, 503, 602));
    EXPECT_THAT(journal.tally().leftOut,
                testing::ElementsAre(testing::Pair("health", 1), testing::Pair("jump", 1),
                                     testing::Pair("no-delay", 1)));
}

TEST_F(JournalTest, WhatIsLeftOutButNotForWantOfADelayKeepsTheClockLocked) {
    becomeUsable();
    journal.pair(300, 302);
    journal.pair(400, 500000400);
    EXPECT_EQ(journal.health().health.state, HealthState::locked);
    EXPECT_EQ((Result{0, contentOf(path), {}}.events("health").size()), 1U);
}

TEST_F(JournalTest, ANewSessionIsJudgedAnew) {
    becomeUsable();
    journal.pair(300, 302);
    journal.note(initialisedEvent({{"interface", Json::array()}}));
    becomeUsable();
    journal.pair(400, 500000400);
    EXPECT_FALSE(pairs().back().contains("leftOut"));
}
