#include "Report/Limits.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace {

/// What is at the limits of class B, and was measured for 2000 s.
TimeErrorFigures atTheLimitsOfB() {
    TimeErrorFigures figures;
    figures.seconds = 2000;
    figures.extent = {-70, 12};
    figures.mean = 1;
    figures.averages = 2;
    figures.constant = Extent{-20, 20};
    figures.lowPassRange = 45;
    figures.highPassRange = 70;
    figures.low.mtie = {{1, 30, 9}, {512, 39, 9}, {1000, 40, 9}, {1024, 41, 9}};
    figures.low.tdev = {{1, 1, 9}, {256, 4, 9}, {512, 3, 9}, {1024, 5, 9}};
    return figures;
}

std::vector<std::string> results(const TimeErrorFigures& figures, const std::string& limits) {
    std::vector<std::string> all;
    for (const auto& each : verdictsOf(figures, *findLimits(limits))) {
        all.emplace_back(each.result);
    }
    return all;
}

/// Which verdict of class B becomes "fail" by this change, and no other does.
template <typename Change>
std::string failing(Change change) {
    auto figures = atTheLimitsOfB();
    change(figures);
    std::string names;
    for (const auto& each : verdictsOf(figures, *findLimits("class-B"))) {
        if (each.result == std::string("fail")) {
            names += each.quantity;
        }
    }
    return names;
}

} // namespace

TEST(Limits, AreThoseOfTheRecommendation) {
    EXPECT_THAT(limitNames(), ElementsAre("class-A", "class-B", "class-C"));
    const auto limits = [](const char* name) {
        std::vector<double> all;
        for (const auto& each : verdictsOf(atTheLimitsOfB(), *findLimits(name))) {
            all.push_back(each.limit.value_or(0));
        }
        return all;
    };
    EXPECT_THAT(limits("class-A"), ElementsAre(100, 50, 40, 4, 70));
    EXPECT_THAT(limits("class-B"), ElementsAre(70, 20, 40, 4, 70));
    EXPECT_THAT(limits("class-C"), ElementsAre(30, 10, 10, 2, 0));
    EXPECT_EQ(findLimits("class-D"), nullptr);
    EXPECT_EQ(findLimits(""), nullptr);
}

TEST(Limits, WhatIsAtTheLimitPasses) {
    EXPECT_THAT(results(atTheLimitsOfB(), "class-A"),
                ElementsAre("pass", "pass", "pass", "pass", "pass"));
    EXPECT_THAT(results(atTheLimitsOfB(), "class-B"),
                ElementsAre("pass", "pass", "pass", "pass", "pass"));
    EXPECT_THAT(results(atTheLimitsOfB(), "class-C"),
                ElementsAre("fail", "fail", "fail", "fail", "none"));
}

TEST(Limits, EachIsExceededByItsQuantityAlone) {
    EXPECT_EQ(failing([](auto& figures) { figures.extent.low = -70.1; }), "max|TE|");
    EXPECT_EQ(failing([](auto& figures) { figures.constant->low = -20.1; }), "cTE");
    EXPECT_EQ(failing([](auto& figures) { figures.low.mtie[2].value = 40.1; }), "dTE_L MTIE");
    EXPECT_EQ(failing([](auto& figures) { figures.low.tdev[1].value = 4.1; }), "dTE_L TDEV");
    EXPECT_EQ(failing([](auto& figures) { figures.highPassRange = 70.1; }), "dTE_H peak to peak");
}

TEST(Limits, TheWorstTauIsNamedAndThoseBeyondThousandSecondsDoNotCount) {
    const auto verdicts = verdictsOf(atTheLimitsOfB(), *findLimits("class-B"));
    EXPECT_EQ(verdicts[2].value, 40);
    EXPECT_EQ(verdicts[2].tau, 1000);
    EXPECT_EQ(verdicts[3].value, 4);
    EXPECT_EQ(verdicts[3].tau, 256);
    EXPECT_FALSE(verdicts[0].tau);
}

TEST(Limits, WhatWasMeasuredForTooShortATimeIsOpenUnlessItFails) {
    auto figures = atTheLimitsOfB();
    figures.seconds = 600;
    figures.constant.reset();
    figures.mean = 50;
    figures.low.mtie.resize(2);
    figures.low.tdev.resize(2);
    EXPECT_THAT(results(figures, "class-B"), ElementsAre("open", "open", "open", "open", "open"));
    EXPECT_THAT(results(figures, "class-C"), ElementsAre("fail", "open", "fail", "fail", "none"));
}

TEST(Limits, WhereNothingWasMeasuredNothingIsJudged) {
    TimeErrorFigures figures;
    const auto verdicts = verdictsOf(figures, *findLimits("class-A"));
    EXPECT_THAT(results(figures, "class-A"), ElementsAre("open", "open", "open", "open", "open"));
    EXPECT_FALSE(verdicts[2].value);
    EXPECT_FALSE(verdicts[3].value);
    EXPECT_FALSE(verdicts[4].value);
}
