#include "Status/StatusPage.h"

#include <gtest/gtest.h>

#include "Status/StatusText.h"

using namespace vantelhost;

namespace {

Moment at(double seconds) {
    return {seconds, 0};
}

/// Everything that a run can be asked about.
void fill(StatusPage& page) {
    constexpr double quality[] = {2.5e-08, 1e-06, -1.0};
    page.take(loadedEvent("l", "IEEE 1588-2008 BC", 2), at(0));
    page.take(startedEvent(), at(1));
    page.take(restartEvent("ptp4l ended", 1, 2), at(2));
    page.take(startedEvent(), at(3));
    page.take(qualityEvent(quality, "PTP role has changed."), at(5));
    page.take(metadataEvent({{"gmClockId", "00:1B:21:FF:FE:0A:0B:0C"},
                             {"gmClockClass", 6},
                             {"gmClockAccuracy", "WITHIN_100NS"},
                             {"localClockId", "02:00:00:FF:FE:00:00:01"},
                             {"clockClass", 248},
                             {"clockAccuracy", "ACCURACY_UNKNOWN"},
                             {"Port1", {{"portState", "PTP_UNCALIBRATED"}, {"interface", "e0"}}}}),
              at(5));
    page.take(pairEvent(100, 100, 0, PairKind::falseOffset), at(6));
    page.take(pairEvent(100, 400, 300), at(7));
    page.take(healthEvent("locked", "time pairs arrive", "unmeasured", 1), at(7));
    page.take(pairEvent(1000, 600, -400), at(100));
    page.takeChrony({2, 1, 4});
    page.take(chronyEvent({1, 0, 0}, ""), at(100));
}

} // namespace

TEST(StatusPage, TellsARunFromTheBeginning) {
    const Json status = StatusPage().at(1.5);
    EXPECT_EQ(status["health"], "starting");
    EXPECT_EQ(status["uptime"], 1.5);
    for (const char* name : {"last", "minute", "hour", "chrony"}) {
        EXPECT_TRUE(status[name].is_null()) << name;
    }
    EXPECT_EQ(status["ports"], Json::object());
    EXPECT_EQ(statusText(status), "Health          : starting for 0:00:01\n"
                                  "Quality         : none yet\n"
                                  "Grandmaster     : none yet\n"
                                  "This clock      : none yet\n"
                                  "Last offset     : none\n"
                                  "Last minute     : none\n"
                                  "Last hour       : none\n"
                                  "Pairs           : 0\n"
                                  "Ports           : none\n"
                                  "chronyd         : gets no pairs\n"
                                  "Running         : 0:00:01, 0 restarts, \n");
}

TEST(StatusPage, TellsAllOfARun) {
    StatusPage page;
    fill(page);
    const Json status = page.at(100.25);
    EXPECT_EQ(status["health"], "locked");
    EXPECT_EQ(status["reason"], "time pairs arrive");
    EXPECT_EQ(status["since"], 93.25);
    EXPECT_EQ(status["restarts"], 2);
    EXPECT_EQ(status["quality"], "usable");
    EXPECT_EQ(status["clocks"]["gmClockClass"], 6);
    EXPECT_FALSE(status["clocks"].contains("Port1"));
    EXPECT_EQ(status["ports"]["Port1"]["interface"], "e0");
    EXPECT_EQ(status["last"], Json({{"offset", -400}, {"age", 0.25}}));
    EXPECT_EQ(status["minute"], Json({{"pairs", 1}, {"rms", 400.0}, {"min", -400}, {"max", -400}}));
    EXPECT_EQ(status["hour"]["pairs"], 2);
    EXPECT_EQ(status["hour"]["max"], 300);
    EXPECT_EQ(status["pairs"], 3);
    EXPECT_EQ(status["leftOut"], Json({{"no-delay", 1}}));
    EXPECT_EQ(status["chrony"]["sent"], 2);
    EXPECT_EQ(status["chrony"]["withheld"], 4);
    EXPECT_EQ(statusText(status),
              "Health          : locked for 0:01:33 (time pairs arrive)\n"
              "Quality         : usable (PTP role has changed.)\n"
              "Grandmaster     : 00:1B:21:FF:FE:0A:0B:0C, class 6, WITHIN_100NS\n"
              "This clock      : 02:00:00:FF:FE:00:00:01, class 248, ACCURACY_UNKNOWN\n"
              "Last offset     : -400 ns, 0.2 s ago\n"
              "Last minute     : rms 400 ns, max 400 ns in 1 pairs\n"
              "Last hour       : rms 354 ns, max 400 ns in 2 pairs\n"
              "Pairs           : 3, 1 left out: no-delay 1\n"
              "Port1           : PTP_UNCALIBRATED on e0\n"
              "chronyd         : takes the pairs; 2 sent, 1 failed, 4 withheld\n"
              "Running         : 0:01:40, 2 restarts, IEEE 1588-2008 BC\n");
}
