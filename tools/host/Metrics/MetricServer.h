/// @file
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "Events.h"
#include "Metrics/ListenAddress.h"
#include "Moment.h"

namespace prometheus {
class Collectable;
class Exposer;
} // namespace prometheus

namespace vantelhost {

/// Answers whoever asks for metrics over HTTP, with the threads of prometheus-cpp's exposer: three
/// while it listens. A client holds one of them, for 2 s at most, and nothing else.
class MetricServer {
public:
    using Clock = Moment::Clock;

    MetricServer(ListenAddress address, std::shared_ptr<prometheus::Collectable> metrics);

    /// Takes up to 2 s when it listens.
    ~MetricServer();
    MetricServer(const MetricServer&) = delete;
    MetricServer& operator=(const MetricServer&) = delete;

    /// Listens, unless it does already or has tried in the last 10 s. To be called again and again,
    /// by one thread.
    /// @return an event when it begins to listen, or fails for another reason than before.
    std::optional<Event> attend(Clock::time_point now = Clock::now());

private:
    /// @return why it does not work; empty when it does.
    std::string listen();

    /// With the port that was chosen where any would do.
    std::string addressInUse() const;

    const ListenAddress address_;
    const std::shared_ptr<prometheus::Collectable> metrics_;
    std::unique_ptr<prometheus::Exposer> exposer_;
    Clock::time_point nextTry_ = Clock::time_point::min();
    std::string problem_; ///< of the last try
};

} // namespace vantelhost
