/// @file
/// What the metrics of a run are made of.
#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <string>
#include <vector>

#include "Health.h"
#include "Metrics/AtomicHistogram.h"
#include "Metrics/Published.h"
#include "PairKind.h"

namespace vantelhost {

inline constexpr std::array qualityNames{"usable", "unusable", "other"};

/// The last quality; both are empty before the first.
struct QualityLabels {
    std::string quality;
    std::string reason;
};

/// The grandmaster, as the metadata have it; empty while ptp4l is not heard.
struct GrandmasterLabels {
    std::string identity;
    std::string clockClass;
    std::string accuracy;
    std::string priority1;
    std::string priority2;
};

/// A port, as the metadata have it.
struct PortLabels {
    std::string port; ///< its number
    std::string interface;
    int state; ///< linuxptp's number, which is that of IEEE 1588; 0 when unknown
};

/// The clocks and ports of the last metadata.
struct ClockLabels {
    GrandmasterLabels grandmaster;
    std::vector<PortLabels> ports;
};

/// One thread at a time writes, any may read meanwhile.
struct MetricValues {
    using Count = std::atomic<std::uint64_t>;

    std::atomic<HealthState> health{HealthState::starting};
    Count healthChanges{0};
    Count restarts{0};
    Count failedPolls{0};
    Count pairs{0};                                            ///< those left out, too
    std::array<Count, std::size(leftOutKinds)> pairsLeftOut{}; ///< in the order of those
    std::atomic<double> lastPair{
        -1}; ///< seconds since the beginning of the run; below 0 when none came
    std::atomic<bool> hasOffset{false};
    std::atomic<std::int64_t> offset{0}; ///< of the last pair that was not left out, nanoseconds
    Count grandmasterChanges{0};
    Count hostCallErrors{0};
    Count errors{0};
    std::atomic<bool> usesChrony{false};
    Count chronySent{0};
    Count chronyFailed{0};
    Count chronyWithheld{0};
    AtomicHistogram offsets;    ///< seconds, without their sign
    AtomicHistogram pollDelays; ///< seconds
    Published<QualityLabels> quality;
    Published<ClockLabels> clocks;

    MetricValues();
};

} // namespace vantelhost
