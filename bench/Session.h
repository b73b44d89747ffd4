/// @file
#pragma once

#include <string>

#include "support/EpochFifo.h"

/// Links the simulated daemon into the working folder, where a session starts it.
/// @param script lines for it.
/// @return the protocol configuration.
std::string useSimulator(const std::string& script);

/// The same with linuxptp's daemon, in a scene of scripts/testbed.sh with plug-in paths.
std::string useRealDaemon();

/// A session of the plug-in in this process. Its calls throw when they fail.
class Session {
public:
    explicit Session(const std::string& configuration);

    /// Stops it.
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    void start();
    void stop();

private:
    const EpochFifo fifo_;
    void* slot_ = nullptr;
};
