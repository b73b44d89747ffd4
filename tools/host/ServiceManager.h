/// @file
#pragma once

#include <string>

namespace vantelhost {

/// What systemd hears of a service of Type=notify (sd_notify). Where it does not want to hear, this
/// does nothing.
class ServiceManager {
public:
    /// The clock runs.
    void isReady() const;

    /// The run ends. What it still does takes no longer than a stop may.
    void isStopping() const;

    /// One line for people; only a new one is sent.
    void status(const std::string& text);

    /// That all is well, for the watchdog (WatchdogSec=). To be called several times a second.
    void feedWatchdog() const;

private:
    std::string status_;
};

} // namespace vantelhost
