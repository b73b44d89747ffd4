/// @file
#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <vector>

#include <prometheus/client_metric.h>

namespace vantelhost {

/// Counts values by their size. One thread at a time may count; any may read meanwhile.
class AtomicHistogram {
public:
    /// @param bounds upper ends of the buckets, which belong to them; ascending. A last one takes
    ///               what is above.
    explicit AtomicHistogram(std::vector<double> bounds);

    /// Never waits.
    void count(double value);

    /// The buckets as Prometheus wants them: each with all below it.
    prometheus::ClientMetric::Histogram read() const;

private:
    const std::vector<double> bounds_;
    std::vector<std::atomic<std::uint64_t>> counts_; ///< of each bucket alone
    std::atomic<double> sum_{0};
};

} // namespace vantelhost
