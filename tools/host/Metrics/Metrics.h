/// @file
#pragma once

#include <cstdint>
#include <memory>
#include <optional>

#include "Events.h"
#include "Metrics/ListenAddress.h"
#include "Metrics/MetricServer.h"
#include "Metrics/MetricSink.h"
#include "Metrics/MetricValues.h"
#include "Moment.h"

namespace vantelhost {

/// The metrics of a run, and who serves them.
class Metrics {
public:
    /// @param begin of the run
    Metrics(const ListenAddress& address, Moment::Clock::time_point begin);

    /// One event at a time, from any thread. Never waits for who asks for metrics.
    void take(const Event& event, const Moment& moment) { sink_.take(event, moment); }

    /// As above.
    void takeChrony(const ChronyCounts& counts);

    /// Listens, if it does not: see MetricServer.
    std::optional<Event> attend() { return server_.attend(); }

private:
    MetricValues values_;
    MetricSink sink_{values_};
    MetricServer server_;
};

} // namespace vantelhost
