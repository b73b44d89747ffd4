#include "Metrics/MetricServer.h"

#include <chrono>
#include <exception>
#include <utility>
#include <vector>

#include <prometheus/exposer.h>

namespace vantelhost {

namespace {

constexpr std::chrono::seconds timeBetweenTries(10);

} // namespace

MetricServer::MetricServer(ListenAddress address, std::shared_ptr<prometheus::Collectable> metrics)
    : address_(std::move(address)), metrics_(std::move(metrics)) {}

MetricServer::~MetricServer() = default;

std::optional<Event> MetricServer::attend(Clock::time_point now) {
    if (exposer_ || now < nextTry_) {
        return std::nullopt;
    }
    nextTry_ = now + timeBetweenTries;
    const std::string former = std::exchange(problem_, listen());
    if (!exposer_ && problem_ == former) {
        return std::nullopt;
    }
    return metricsEvent(addressInUse(), problem_);
}

std::string MetricServer::listen() {
    // The exposer would not tell the reason.
    std::string problem = listeningProblem(address_);
    if (!problem.empty()) {
        return problem;
    }
    try {
        exposer_ = std::make_unique<prometheus::Exposer>(std::vector<std::string>{
            "listening_ports", address_.text(), "num_threads", "2", "request_timeout_ms", "2000"});
        exposer_->RegisterCollectable(metrics_);
        return "";
    } catch (const std::exception& error) {
        exposer_.reset();
        return address_.socketAddress.ss_family == AF_INET6
                   ? "the HTTP server takes no IPv6 address: civetweb, built without it?"
                   : error.what();
    }
}

std::string MetricServer::addressInUse() const {
    ListenAddress address = address_;
    if (exposer_) {
        address.port = exposer_->GetListeningPorts().at(0);
    }
    return address.text();
}

} // namespace vantelhost
