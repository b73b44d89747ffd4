/// @file
/// The metrics of a run.
#pragma once

#include <string>
#include <utility>
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

    /// Of a metric that is a histogram, and has no labels.
    void add(prometheus::ClientMetric::Histogram histogram);

    /// All of them; there are none then.
    std::vector<prometheus::ClientMetric> take() { return std::move(samples_); }

private:
    const MetricRow& row_;
    std::vector<prometheus::ClientMetric> samples_;
};

/// A metric: what Prometheus is told of it, and where its samples come from.
struct MetricRow {
    const char* name;
    prometheus::MetricType type;
    std::vector<const char*> labels;
    const char* help;

    /// @param seconds since the beginning of the run
    void (*sample)(Samples& samples, const MetricValues& values, double seconds);
};

/// All metrics of a run, in the order in which they are served.
const std::vector<MetricRow>& metricTable();

} // namespace vantelhost
