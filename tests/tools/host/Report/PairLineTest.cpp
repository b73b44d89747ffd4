#include "Report/PairLine.h"

#include <gtest/gtest.h>

#include "EventPrinter.h"
#include "Events.h"

using namespace vantelhost;

TEST(PairLine, IsReadAsItIsWritten) {
    const auto text = jsonLine(pairEvent(UINT64_MAX, 5, 6), {86400.25, 1795261620276518056});
    ASSERT_EQ(text, R"({"event":"pair","t":86400.25,"time":1795261620276518056,)"
                    R"("reference":18446744073709551615,"local":5,"offset":6})");
    const auto line = parsePairLine(text);
    ASSERT_TRUE(line);
    EXPECT_EQ(line->t, 86400.25);
    EXPECT_EQ(line->time, 1795261620276518056U);
    EXPECT_EQ(line->local, 5U);
    EXPECT_EQ(line->offset, 6);
    EXPECT_EQ(line->leftOut, "");
}

TEST(PairLine, MayHaveTheHostsJudgement) {
    const auto line = parsePairLine(
        R"({"event":"pair","t":0.5,"time":7,"reference":1,"local":5,"offset":-6,"leftOut":"1970"})");
    ASSERT_TRUE(line);
    EXPECT_EQ(line->leftOut, "1970");
    EXPECT_EQ(line->offset, -6);
    EXPECT_EQ(judgementOf("1970"), PairKind::of1970);
    EXPECT_EQ(judgementOf("no-delay"), PairKind::falseOffset);
    EXPECT_EQ(judgementOf("jump"), PairKind::jump);
    EXPECT_EQ(judgementOf("health"), PairKind::measured);
    EXPECT_FALSE(judgementOf(""));
    EXPECT_FALSE(judgementOf("new"));
}

TEST(PairLine, MayHaveItsTimeInTheSystemsClock) {
    const Carried carried{1795261583276518056, 150, true};
    for (const auto kind : {PairKind::measured, PairKind::falseOffset}) {
        const auto text = jsonLine(pairEvent(1, 5, -6, kind, carried), {0.5, 7});
        const auto line = parsePairLine(text);
        ASSERT_TRUE(line);
        EXPECT_EQ(line->realtime, 1795261583276518056U);
        EXPECT_EQ(line->leftOut, kind == PairKind::measured ? "" : "no-delay");
    }
    const auto plain = parsePairLine(jsonLine(pairEvent(1, 5, -6), {0.5, 7}));
    EXPECT_FALSE(plain->realtime);
}

TEST(PairLine, AnythingElseIsLeftToTheReaderOfJson) {
    const std::string good =
        R"({"event":"pair","t":10.5,"time":7,"reference":1,"local":5,"offset":-6})";
    ASSERT_TRUE(parsePairLine(good));
    for (std::size_t length = 0; length < good.size(); ++length) {
        EXPECT_FALSE(parsePairLine(good.substr(0, length))) << length;
    }
    for (const auto* const t : {"inf", "nan", "-1", "1.", ".5", "01.5", "1e5", "", "1 ", "0x1"}) {
        auto bad = good;
        bad.replace(bad.find("10.5"), 4, t);
        EXPECT_FALSE(parsePairLine(bad)) << t;
    }
    for (
        const auto* const other : {
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":5,"offset":-6} )",
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":5,"offset":-6,"new":1})",
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":5,"offset":-6,"leftOut":"1970})",
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":5,"offset":-6,"realtime":1})",
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":-5,"offset":-6})",
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":5,"offset":9223372036854775808})",
            R"({"event":"pair","t":1,"time":7,"reference":1,"local":18446744073709551616,"offset":0})",
            R"({"event":"pairs","t":1,"time":7,"reference":1,"local":5,"offset":-6})",
            R"({"t":1,"event":"pair","time":7,"reference":1,"local":5,"offset":-6})",
        }) {
        EXPECT_FALSE(parsePairLine(other)) << other;
    }
}
