/// @file
#pragma once

#include <string>

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

    /// CPU time that this client has taken so far, in seconds.
    virtual double cpuSeconds() const = 0;

private:
    std::string name_;
};
