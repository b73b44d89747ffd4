/// @file
#pragma once

#include <string>

#include "protocolConfig.h"
#include "tHost.h"

namespace zekelVantel {

/// One session of the host: a boundary clock that is configured once, started, and stopped.
class tPtp4lTimeRef {
public:
    /// Reads the configuration and writes ptp4l's configuration file.
    /// @param context the session slot's address, the host's name for this session.
    /// @throws as readProtocolConfig.
    tPtp4lTimeRef(void** context, const std::string& protocolConfig);

    /// @throws zeerr::Exception -52010: this version cannot run ptp4l yet.
    void start();

    /// @throws zeerr::Exception -52010: this version cannot run ptp4l yet.
    void stop();

private:
    tHost host_;
    tProtocolConfig config_;
};

} // namespace zekelVantel
