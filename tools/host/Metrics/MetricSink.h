/// @file
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "Events.h"
#include "Metrics/MetricValues.h"
#include "Moment.h"

namespace vantelhost {

/// Takes the events of a run, one at a time, for its metrics. Quick: numbers are stored, and labels
/// published when they change.
class MetricSink {
public:
    /// @param values outlive this.
    explicit MetricSink(MetricValues& values) : values_(values) {}

    /// Events that no metric tells of are passed over.
    void take(const Event& event, const Moment& moment);

private:
    void takeHealth(const Event& event, const Moment& moment);
    void takeRestart(const Event& event, const Moment& moment);
    void takeEpochOffset(const Event& event, const Moment& moment);
    void takeQuality(const Event& event, const Moment& moment);
    void takePair(const Event& event, const Moment& moment);
    void takeMetadata(const Event& event, const Moment& moment);
    void takeError(const Event& event, const Moment& moment);

    void countLeftOut(std::string_view word);
    void countPollDelay(std::uint64_t ingress, std::uint64_t now);
    void takeGrandmaster(const std::string& identity, std::string_view ownIdentity);

    MetricValues& values_;
    std::uint64_t epochOffset_ = 0;
    std::string quality_;
    std::string reason_;
    std::string grandmaster_; ///< the last that was another clock
};

} // namespace vantelhost
