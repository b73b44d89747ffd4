/// @file
#pragma once

#include <atomic>
#include <cstdint>
#include <string>
#include <thread>
#include <vector>

#include "support/DatagramSocket.h"

/// Answers the plug-in in place of a daemon, with measurements that a test chooses poll by poll. A
/// clock without ports; its data sets are all zero.
class HandDrivenDaemon {
public:
    /// What TIME_STATUS_NP shows.
    struct Measurement {
        std::uint64_t masterOffset = 0; ///< as the 64 bits on the wire
        std::uint64_t ingressTime = 0;
        std::uint32_t gmPresent = 0;
    };

    /// @param polls the first poll gets the first measurement, and so on; the last one stays.
    HandDrivenDaemon(const std::string& path, std::vector<Measurement> polls);
    ~HandDrivenDaemon();
    HandDrivenDaemon(const HandDrivenDaemon&) = delete;
    HandDrivenDaemon& operator=(const HandDrivenDaemon&) = delete;

private:
    void run();
    void answer(const DatagramSocket::Datagram& request);

    DatagramSocket socket_;
    std::vector<Measurement> polls_;
    std::size_t next_ = 0;
    std::atomic<bool> stopRequested_{false};
    std::thread thread_;
};
