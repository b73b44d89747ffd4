/// @file
#pragma once

#include <cstdint>
#include <memory>
#include <string>

/// A daemon that the clients ask.
class Daemon {
public:
    virtual ~Daemon() = default;

    /// Path of its management socket.
    virtual std::string socket() const = 0;

    /// Kinds: "stub", a thread of this process that knows its answers by heart; "simptp4l", the
    /// simulated daemon; "ptp4l", linuxptp's, in a scene of scripts/testbed.sh that has the ports.
    static std::unique_ptr<Daemon> make(const std::string& kind, std::uint16_t ports);
};
