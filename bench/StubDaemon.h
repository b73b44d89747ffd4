/// @file
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <thread>
#include <vector>

#include "support/DatagramSocket.h"

/// A daemon that costs as little as can be: it answers at once, from a thread of its own, with what
/// FakePtp4l would say. It knows that by heart, and takes no memory.
class StubDaemon {
public:
    StubDaemon(const std::string& path, std::uint16_t ports);
    ~StubDaemon();
    StubDaemon(const StubDaemon&) = delete;
    StubDaemon& operator=(const StubDaemon&) = delete;

private:
    void run() const;

    std::map<std::uint16_t, std::vector<Octets>> answers_;
    DatagramSocket socket_;
    std::thread thread_;
};
