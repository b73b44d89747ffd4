/// @file
#pragma once

#include <vector>

#include <prometheus/collectable.h>

#include "Metrics/MetricValues.h"
#include "Moment.h"

namespace vantelhost {

/// The metrics of a run as they are when somebody asks. Thread-safe.
class MetricPage : public prometheus::Collectable {
public:
    /// @param values outlive this.
    /// @param begin  the seconds of the values count from then.
    MetricPage(const MetricValues& values, Moment::Clock::time_point begin)
        : values_(values), begin_(begin) {}

    std::vector<prometheus::MetricFamily> Collect() const override;

private:
    const MetricValues& values_;
    const Moment::Clock::time_point begin_;
};

} // namespace vantelhost
