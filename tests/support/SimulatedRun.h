/// @file
#pragma once

#include <string>

#include "support/Child.h"

/// The reference host with the plug-in and the simulated ptp4l, which serves metrics on a free
/// port.
class SimulatedRun {
public:
    /// @param folder  made, if it is missing; the plug-in of the tests has its paths below it.
    /// @param script  lines for the simulated ptp4l
    /// @param options more of the host
    /// @param port    of this machine, where metrics are served; 0: one that is free
    SimulatedRun(const std::string& folder, const std::string& script,
                 const Child::Words& options = {}, int port = 0);

    Child& host() { return host_; }

    /// Where it serves metrics; 0 when it does not.
    int metricsPort();

private:
    Child host_;
};
