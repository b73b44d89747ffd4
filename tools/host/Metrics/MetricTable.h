/// @file
/// The metrics of a run.
#pragma once

#include <string>
#include <vector>

#include <prometheus/metric_family.h>

#include "Metrics/MetricValues.h"

namespace vantelhost {

struct MetricRow;

/// Gathers the samples of a metric.
class Samples {
public:
    explicit Samples(const MetricRow& row) : row_(row) {}

    /// @param labels their values, in the order of the metric's labels
    void add(double value, const std::vector<std::string>& labels = {});
    void add(prometheus::ClientMetric::Histogram histogram);

    std::vector<prometheus::ClientMetric> take() { return std::move(samples_); }

private:
    const MetricRow& row_;
    std::vector<prometheus::ClientMetric> samples_;
};

struct MetricRow {
    const char* name;
    prometheus::MetricType type;
    std::vector<const char*> labels;
    const char* help;

    /// @param seconds since the beginning of the run
    void (*sample)(Samples& samples, const MetricValues& values, double seconds);
};

const std::vector<MetricRow>& metricTable();

} // namespace vantelhost
