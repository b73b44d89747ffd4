/// @file
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

using Octets = std::vector<std::uint8_t>;

/// The other end of the plug-in's datagrams: a Unix-domain socket that a test drives by hand.
class DatagramSocket {
public:
    struct Datagram {
        Octets octets;
        std::string source; ///< path of the sender, "" if it has none
    };

    /// Has no path of its own.
    DatagramSocket();

    /// @param path up to 108 octets, the last of which need not be a zero.
    explicit DatagramSocket(const std::string& path);

    /// Closes, and leaves the path in the file system as a process does that was killed.
    ~DatagramSocket();
    DatagramSocket(const DatagramSocket&) = delete;
    DatagramSocket& operator=(const DatagramSocket&) = delete;

    int descriptor() const { return descriptor_; }

    /// Waits until there is room in the receiver's queue. @return false on failure, see errno.
    bool sendTo(const std::string& path, const Octets& octets) const;

    /// Sends until the receiver's queue is full.
    void fillQueueOf(const std::string& path) const;

    /// @return nothing when no datagram came before the deadline.
    std::optional<Datagram>
    receive(std::chrono::milliseconds deadline = std::chrono::seconds(10)) const;

    /// @return what waits in the queue, if anything.
    std::optional<Datagram> receiveQueued() const { return receive(std::chrono::milliseconds(0)); }

private:
    int descriptor_;
};
