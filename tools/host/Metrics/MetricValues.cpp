#include "Metrics/MetricValues.h"

namespace vantelhost {

namespace {

/// 1, 2 and 5 of each power of ten from 10 ns to 1 s.
std::vector<double> offsetBounds() {
    return {1e-8, 2e-8, 5e-8, 1e-7, 2e-7, 5e-7, 1e-6, 2e-6, 5e-6, 1e-5, 2e-5, 5e-5, 1e-4,
            2e-4, 5e-4, 1e-3, 2e-3, 5e-3, 1e-2, 2e-2, 5e-2, 0.1,  0.2,  0.5,  1};
}

/// From the time that ptp4l takes for a Sync, past the 128 ms that polls aim at.
std::vector<double> pollDelayBounds() {
    return {1e-3, 2e-3,   3e-3, 4e-3, 5e-3, 7.5e-3, 1e-2, 1.5e-2, 2e-2, 3e-2,
            5e-2, 7.5e-2, 0.1,  0.13, 0.2,  0.3,    0.5,  1,      2,    5};
}

} // namespace

MetricValues::MetricValues() : offsets(offsetBounds()), pollDelays(pollDelayBounds()) {}

} // namespace vantelhost
