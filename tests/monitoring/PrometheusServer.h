/// @file
#pragma once

#include <string>
#include <vector>

#include <nlohmann/json.hpp>

#include "support/Child.h"

/// A Prometheus of this machine that scrapes five times a second, on a free port.
class PrometheusServer {
public:
    /// Whether there is one to start.
    static bool isInstalled();

    /// @param folder where its files go
    /// @param ports  of this machine that it scrapes, as the job "vantel"
    PrometheusServer(const std::string& folder, const std::vector<int>& ports);

    /// Whether it listens.
    bool isReady() const { return port_ != 0; }

    /// The samples that an expression has now, as its API tells them: "metric" with the labels, and
    /// "value". Empty when there are none; one that is no expression fails the test.
    nlohmann::json query(const std::string& expression) const;

private:
    Child program_;
    int port_ = 0;
};
