#include "Metrics/MetricTable.h"

#include <cstddef>
#include <utility>

namespace vantelhost {

namespace {

using prometheus::MetricType;

double number(std::uint64_t count) {
    return static_cast<double>(count);
}

void sampleHealth(Samples& samples, const MetricValues& values, double /*seconds*/) {
    const HealthState health = values.health;
    for (const HealthState state : allHealthStates) {
        samples.add(state == health ? 1 : 0, {nameOf(state)});
    }
}

void sampleQuality(Samples& samples, const MetricValues& values, double /*seconds*/) {
    const auto quality = values.quality.get();
    for (const char* const name : qualityNames) {
        samples.add(quality->quality == name ? 1 : 0, {name});
    }
}

void sampleQualityInfo(Samples& samples, const MetricValues& values, double /*seconds*/) {
    const auto quality = values.quality.get();
    if (!quality->quality.empty()) {
        samples.add(1, {quality->quality, quality->reason});
    }
}

void samplePairAge(Samples& samples, const MetricValues& values, double seconds) {
    const double last = values.lastPair;
    if (last >= 0) {
        samples.add(seconds - last);
    }
}

void sampleOffset(Samples& samples, const MetricValues& values, double /*seconds*/) {
    if (values.hasOffset) {
        samples.add(static_cast<double>(values.offset) * 1e-9);
    }
}

void samplePairsLeftOut(Samples& samples, const MetricValues& values, double /*seconds*/) {
    for (std::size_t i = 0; i < values.pairsLeftOut.size(); ++i) {
        samples.add(number(values.pairsLeftOut.at(i)), {leftOutWord(leftOutKinds[i])});
    }
}

void sampleChrony(Samples& samples, const MetricValues& values, double /*seconds*/) {
    if (values.usesChrony) {
        samples.add(number(values.chronySent), {"sent"});
        samples.add(number(values.chronyFailed), {"failed"});
        samples.add(number(values.chronyWithheld), {"withheld"});
    }
}

void sampleGrandmaster(Samples& samples, const MetricValues& values, double /*seconds*/) {
    const auto clocks = values.clocks.get();
    const GrandmasterLabels& grandmaster = clocks->grandmaster;
    if (!clocks->ports.empty()) {
        samples.add(1, {grandmaster.identity, grandmaster.clockClass, grandmaster.accuracy,
                        grandmaster.priority1, grandmaster.priority2});
    }
}

void samplePorts(Samples& samples, const MetricValues& values, double /*seconds*/) {
    const auto clocks = values.clocks.get();
    for (const auto& port : clocks->ports) {
        samples.add(port.state, {port.port, port.interface});
    }
}

void sampleBuild(Samples& samples, const MetricValues& /*values*/, double /*seconds*/) {
    samples.add(1, {VANTEL_HOST_VERSION});
}

template <MetricValues::Count MetricValues::*count>
void sampleCount(Samples& samples, const MetricValues& values, double /*seconds*/) {
    samples.add(number(values.*count));
}

template <AtomicHistogram MetricValues::*histogram>
void sampleHistogram(Samples& samples, const MetricValues& values, double /*seconds*/) {
    samples.add((values.*histogram).read());
}

} // namespace

void Samples::add(double value, const std::vector<std::string>& labels) {
    prometheus::ClientMetric sample;
    for (std::size_t i = 0; i < row_.labels.size(); ++i) {
        sample.label.push_back({row_.labels.at(i), labels.at(i)});
    }
    sample.gauge.value = value;
    sample.counter.value = value;
    samples_.push_back(std::move(sample));
}

void Samples::add(prometheus::ClientMetric::Histogram histogram) {
    samples_.emplace_back().histogram = std::move(histogram);
}

const std::vector<MetricRow>& metricTable() {
    using Values = MetricValues;
    static const std::vector<MetricRow> table{
        {"vantel_build_info",
         MetricType::Gauge,
         {"version"},
         "1, with the host's version.",
         sampleBuild},
        {"vantel_health",
         MetricType::Gauge,
         {"state"},
         "1 for the state that the clock is in, 0 for the others.",
         sampleHealth},
        {"vantel_health_changes_total",
         MetricType::Counter,
         {},
         "Changes of the health.",
         sampleCount<&Values::healthChanges>},
        {"vantel_session_restarts_total",
         MetricType::Counter,
         {},
         "Sessions that were begun again.",
         sampleCount<&Values::restarts>},
        {"vantel_quality",
         MetricType::Gauge,
         {"quality"},
         "1 for the last quality that the plug-in told, 0 for the others.",
         sampleQuality},
        {"vantel_quality_info",
         MetricType::Gauge,
         {"quality", "reason"},
         "1, with the last quality and its reason.",
         sampleQualityInfo},
        {"vantel_failed_polls_total",
         MetricType::Counter,
         {},
         "Polls that ptp4l did not answer.",
         sampleCount<&Values::failedPolls>},
        {"vantel_pairs_total",
         MetricType::Counter,
         {},
         "Time pairs, those left out included.",
         sampleCount<&Values::pairs>},
        {"vantel_pairs_left_out_total",
         MetricType::Counter,
         {"reason"},
         "Time pairs that no clock may follow.",
         samplePairsLeftOut},
        {"vantel_pair_age_seconds",
         MetricType::Gauge,
         {},
         "Time since the last time pair.",
         samplePairAge},
        {"vantel_offset_seconds",
         MetricType::Gauge,
         {},
         "Offset of the last time pair that was not left out, local minus reference.",
         sampleOffset},
        {"vantel_offset_magnitude_seconds",
         MetricType::Histogram,
         {},
         "Offsets of time pairs that were not left out, without their sign.",
         sampleHistogram<&Values::offsets>},
        {"vantel_poll_delay_seconds",
         MetricType::Histogram,
         {},
         "Time from the arrival of a Sync until its time pair came.",
         sampleHistogram<&Values::pollDelays>},
        {"vantel_grandmaster_info",
         MetricType::Gauge,
         {"identity", "class", "accuracy", "priority1", "priority2"},
         "1, with what the grandmaster tells of itself.",
         sampleGrandmaster},
        {"vantel_grandmaster_changes_total",
         MetricType::Counter,
         {},
         "Grandmasters that took another one's place.",
         sampleCount<&Values::grandmasterChanges>},
        {"vantel_port_state",
         MetricType::Gauge,
         {"port", "interface"},
         "State of a port, as a number of IEEE 1588.",
         samplePorts},
        {"vantel_host_call_errors_total",
         MetricType::Counter,
         {},
         "Calls of the plug-in that break the rules.",
         sampleCount<&Values::hostCallErrors>},
        {"vantel_errors_total",
         MetricType::Counter,
         {},
         "Errors of the run, of whatever kind.",
         sampleCount<&Values::errors>},
        {"vantel_chrony_pairs_total",
         MetricType::Counter,
         {"result"},
         "Time pairs handed to chronyd, those that it did not take, and those withheld from it.",
         sampleChrony},
    };
    return table;
}

} // namespace vantelhost
