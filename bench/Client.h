/// @file
#pragma once

#include <string>

#include "Clocks.h"

/// One way to ask a daemon for all six data sets.
class Client {
public:
    explicit Client(std::string name) : name_(std::move(name)) {}
    virtual ~Client() = default;
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    const std::string& name() const { return name_; }

    /// Six requests and all their answers. Throws when one is missing.
    virtual void poll() = 0;

    /// CPU time that this client has taken so far, in seconds: by default that of the thread.
    virtual double cpuSeconds() const { return secondsOf(CLOCK_THREAD_CPUTIME_ID); }

private:
    std::string name_;
};
