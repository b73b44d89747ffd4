// What events make of the metrics, as Prometheus reads them.

#include "Metrics/MetricSink.h"

#include <array>
#include <atomic>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <prometheus/text_serializer.h>

#include "Metrics/MetricPage.h"

using namespace vantelhost;
using testing::HasSubstr;
using testing::Not;

namespace {

constexpr std::uint64_t arrival = 1795261620000000000;
constexpr char failedPoll[] =
    "Unable to communicate with PTP sub process while attempting to retrieve time data";

class MetricSinkTest : public testing::Test {
protected:
    void take(const Event& event, std::uint64_t realtime = arrival) {
        sink.take(event, {5, realtime});
    }

    void takeQuality(bool isUsable, const std::string& reason) {
        constexpr std::array usable{2.5e-08, 1e-06, -1.0};
        constexpr std::array unusable{-2.0, -2.0, -1.0};
        take(qualityEvent(isUsable ? usable.data() : unusable.data(), reason));
    }

    void takePair(std::int64_t offset, PairKind kind = PairKind::measured) {
        take(pairEvent(arrival - static_cast<std::uint64_t>(offset), arrival, offset, kind),
             arrival + 4500000);
    }

    void takeMetadata(const std::string& grandmaster) {
        take(metadataEvent({{"gmClockId", grandmaster},
                            {"localClockId", "own"},
                            {"gmClockClass", 6},
                            {"gmClockAccuracy", "WITHIN_100NS"},
                            {"gmPriority1", 128},
                            {"gmPriority2", 127},
                            {"Port1", {{"portState", "PTP_UNCALIBRATED"}, {"interface", "eth0"}}},
                            {"Port12", {{"portState", "PTP_MASTER"}, {"interface", "eth\"1"}}},
                            {"Port3", {{"portState", "new"}}}}));
    }

    std::string page() const {
        const MetricPage metrics(values, Moment::Clock::now());
        return "\n" + prometheus::TextSerializer().Serialize(metrics.Collect());
    }

    MetricValues values;
    MetricSink sink{values};
};

} // namespace

TEST_F(MetricSinkTest, AtFirstNothingIsClaimed) {
    EXPECT_THAT(page(), HasSubstr("\nvantel_health{state=\"starting\"} 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_quality{quality=\"usable\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_pairs_total 0\n"));
    for (const char* const name :
         {"vantel_quality_info{", "vantel_offset_seconds ", "vantel_pair_age_seconds ",
          "vantel_grandmaster_info{", "vantel_port_state{", "vantel_chrony_pairs_total{"}) {
        EXPECT_THAT(page(), Not(HasSubstr(std::string("\n") + name)));
    }
}

TEST_F(MetricSinkTest, OneHealthIsThatOfTheLastEvent) {
    const std::vector<std::string> states{"starting",  "locked", "stale", "unmeasured",
                                          "recovered", "lost",   "dead",  "stopping"};
    for (const auto& state : states) {
        take(healthEvent(state, "", "", 0));
        const std::string text = page();
        for (const auto& other : states) {
            EXPECT_THAT(text, HasSubstr("\nvantel_health{state=\"" + other + "\"} " +
                                        (other == state ? "1\n" : "0\n")));
        }
    }
    EXPECT_THAT(page(), HasSubstr("\nvantel_health_changes_total 8\n"));
}

TEST_F(MetricSinkTest, AQualityHasItsReason) {
    takeQuality(false, "Waiting for ptp4l status");
    takeQuality(true, "say \"yes\"\n\xff");
    EXPECT_THAT(page(), HasSubstr("\nvantel_quality{quality=\"usable\"} 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_quality{quality=\"unusable\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_quality_info{quality=\"usable\",reason=\""
                                  "\\\"say \\\\\\\"yes\\\\\\\"\\\\n\\\\ufffd\\\"\"} 1\n"));
    EXPECT_THAT(page(), Not(HasSubstr("Waiting")));
}

TEST_F(MetricSinkTest, EachFailedPollIsCountedThoughTheQualityStays) {
    takeQuality(false, failedPoll);
    takeQuality(false, failedPoll);
    takeQuality(false, "PTP role has changed.");
    EXPECT_THAT(page(), HasSubstr("\nvantel_failed_polls_total 2\n"));
}

TEST_F(MetricSinkTest, AMeasurementHasAnOffsetAndAPollDelay) {
    takePair(-250);
    EXPECT_THAT(page(), HasSubstr("\nvantel_pairs_total 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_seconds -2.5e-07\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_bucket{le=\"2e-07\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_bucket{le=\"5e-07\"} 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_sum 2.5e-07\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_bucket{le=\"0.004\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_bucket{le=\"0.005\"} 1\n"));
}

TEST_F(MetricSinkTest, TheAgeOfAPairGrows) {
    sink.take(pairEvent(0, 0, 0), {5, 0});
    const MetricPage metrics(values, Moment::Clock::now() - std::chrono::seconds(3605));
    const std::string text = prometheus::TextSerializer().Serialize(metrics.Collect());
    EXPECT_THAT(text, HasSubstr("\nvantel_pair_age_seconds 3600."));
}

TEST_F(MetricSinkTest, APairOf1970IsLeftOutOfAllFigures) {
    takePair(250);
    takePair(999, PairKind::of1970);
    EXPECT_THAT(page(), HasSubstr("\nvantel_pairs_total 2\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_pairs_left_out_total{reason=\"1970\"} 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_pairs_left_out_total{reason=\"no-delay\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_seconds 2.5e-07\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_count 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_count 1\n"));
}

TEST_F(MetricSinkTest, APairWithoutADelayHasAPollDelayAndNoOffset) {
    takePair(0, PairKind::falseOffset);
    EXPECT_THAT(page(), HasSubstr("\nvantel_pairs_left_out_total{reason=\"no-delay\"} 1\n"));
    EXPECT_THAT(page(), Not(HasSubstr("\nvantel_offset_seconds ")));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_count 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_count 1\n"));
}

TEST_F(MetricSinkTest, WhatIsLeftOutIsCountedByItsReasonAndHasAPollDelay) {
    takePair(250);
    for (const auto kind : {PairKind::afterReturn, PairKind::repeated, PairKind::jump,
                            PairKind::jump, PairKind::unhealthy}) {
        takePair(700, kind);
    }
    for (const char* const each : {"return\"} 1", "same\"} 1", "jump\"} 2", "health\"} 1"}) {
        EXPECT_THAT(page(),
                    HasSubstr(std::string("\nvantel_pairs_left_out_total{reason=\"") + each));
    }
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_seconds 2.5e-07\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_count 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_count 6\n"));
}

TEST_F(MetricSinkTest, TheEpochOffsetIsNoPollDelay) {
    take(epochOffsetEvent(-37000000000));
    Event pair = pairEvent(0, arrival - 37000000000, 250);
    take(pair, arrival + 4500000);
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_bucket{le=\"0.004\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_bucket{le=\"0.005\"} 1\n"));
}

TEST_F(MetricSinkTest, AnIngressTimeOfALaterClockHasNoPollDelay) {
    take(pairEvent(0, arrival + 37000000000, 250), arrival);
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_count 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_poll_delay_seconds_sum 0\n"));
}

TEST_F(MetricSinkTest, ExtremeOffsetsAreCounted) {
    take(pairEvent(0, 0, INT64_MIN));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_bucket{le=\"1\"} 0\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_offset_magnitude_seconds_bucket{le=\"+Inf\"} 1\n"));
}

TEST_F(MetricSinkTest, MetadataNameTheGrandmasterAndThePorts) {
    takeMetadata("00:1B");
    EXPECT_THAT(page(), HasSubstr("\nvantel_grandmaster_info{identity=\"00:1B\",class=\"6\","
                                  "accuracy=\"WITHIN_100NS\",priority1=\"128\",priority2=\"127\"} "
                                  "1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_port_state{port=\"1\",interface=\"eth0\"} 8\n"
                                  "vantel_port_state{port=\"12\",interface=\"eth\\\"1\"} 6\n"
                                  "vantel_port_state{port=\"3\",interface=\"\"} 0\n"));
}

TEST_F(MetricSinkTest, MetadataAfterAFailedPollNameNobody) {
    takeMetadata("00:1B");
    take(metadataEvent({{"gmClockId", "00:00"}}));
    EXPECT_THAT(page(), Not(HasSubstr("\nvantel_grandmaster_info{")));
    EXPECT_THAT(page(), Not(HasSubstr("\nvantel_port_state{")));
}

TEST_F(MetricSinkTest, AChangeOfGrandmasterIsOneToAnotherClockThanBefore) {
    takeMetadata("own");
    takeMetadata("first");
    takeMetadata("own");
    take(metadataEvent({{"gmClockId", "00:00"}}));
    takeMetadata("first");
    EXPECT_THAT(page(), HasSubstr("\nvantel_grandmaster_changes_total 0\n"));
    takeMetadata("own");
    takeMetadata("second");
    EXPECT_THAT(page(), HasSubstr("\nvantel_grandmaster_changes_total 1\n"));
    takeMetadata("first");
    EXPECT_THAT(page(), HasSubstr("\nvantel_grandmaster_changes_total 2\n"));
}

TEST_F(MetricSinkTest, ARestartIsCountedAndForgetsThePorts) {
    takeMetadata("first");
    take(restartEvent("dead", 1, 1));
    EXPECT_THAT(page(), HasSubstr("\nvantel_session_restarts_total 1\n"));
    EXPECT_THAT(page(), Not(HasSubstr("\nvantel_port_state{")));
}

TEST_F(MetricSinkTest, ErrorsOfThePluginsCallsAreCountedApart) {
    take(failureEvent("zekel_adjustTime", "called without a status"));
    take(invalidMetadataEvent("{"));
    take(failureEvent("record run.jsonl", "No space left on device"));
    take(statusEvent("start", -52008, "{}"));
    take(statusEvent("start", 1, "{}"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_host_call_errors_total 2\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_errors_total 4\n"));
}

TEST_F(MetricSinkTest, WhatIsExpectedAfterASignalIsNotCounted) {
    constexpr std::array unusable{-2.0, -2.0, -1.0};
    takeQuality(true, "PTP role has changed.");
    take(expectedEvent(qualityEvent(unusable.data(), failedPoll)));
    EXPECT_THAT(page(), HasSubstr("\nvantel_quality{quality=\"usable\"} 1\n"));
    EXPECT_THAT(page(), HasSubstr("\nvantel_failed_polls_total 0\n"));
}

TEST_F(MetricSinkTest, APageIsWholeWhileMetadataAndQualityChange) {
    takeMetadata("first");
    std::atomic<bool> isOver{false};
    std::thread reader([&] {
        while (!isOver) {
            EXPECT_THAT(page(), HasSubstr("\nvantel_port_state{port=\"12\",interface="
                                          "\"eth\\\"1\"} 6\n"));
        }
    });
    for (int i = 0; i < 2000; ++i) {
        takeMetadata(std::to_string(i) + " is a long identity");
        takeQuality(i % 2 == 0, std::to_string(i) + " is a long reason");
    }
    isOver = true;
    reader.join();
}
