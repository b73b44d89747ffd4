/// @file
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <thread>
#include <vector>

#include "support/DatagramSocket.h"

/// Answers the six management requests at once, from a thread of its own, with octets that an
/// encoder of its own has prepared. Ports are numbered from 1; their interfaces are "bc0", "bc1"
/// and so on.
class StubDaemon {
public:
    StubDaemon(const std::string& path, std::uint16_t ports);
    ~StubDaemon();
    StubDaemon(const StubDaemon&) = delete;
    StubDaemon& operator=(const StubDaemon&) = delete;

    /// What is sent back for a request with this managementId, in this order.
    const std::vector<Octets>& answersTo(std::uint16_t managementId) const;

private:
    void run() const;

    std::string path_;
    std::map<std::uint16_t, std::vector<Octets>> answers_;
    DatagramSocket socket_;
    std::thread thread_;
};
