#include "Metrics/AtomicHistogram.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace vantelhost {

AtomicHistogram::AtomicHistogram(std::vector<double> bounds)
    : bounds_(std::move(bounds)), counts_(bounds_.size() + 1) {}

void AtomicHistogram::count(double value) {
    const auto bound = std::lower_bound(bounds_.begin(), bounds_.end(), value);
    counts_[static_cast<std::size_t>(bound - bounds_.begin())].fetch_add(1,
                                                                         std::memory_order_relaxed);
    sum_.store(sum_.load(std::memory_order_relaxed) + value, std::memory_order_relaxed);
}

prometheus::ClientMetric::Histogram AtomicHistogram::read() const {
    prometheus::ClientMetric::Histogram histogram;
    histogram.sample_sum = sum_.load(std::memory_order_relaxed);
    for (std::size_t i = 0; i < counts_.size(); ++i) {
        // The count is what the buckets hold: a value that is counted meanwhile cannot part them.
        histogram.sample_count += counts_[i].load(std::memory_order_relaxed);
        const double bound =
            i < bounds_.size() ? bounds_[i] : std::numeric_limits<double>::infinity();
        histogram.bucket.push_back({histogram.sample_count, bound});
    }
    return histogram;
}

} // namespace vantelhost
