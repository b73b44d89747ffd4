/// @file
/// The simulated daemon's datagram socket.
#pragma once

#include "Fields.h"

#include <optional>
#include <string>
#include <sys/socket.h>
#include <sys/un.h>

namespace simptp4l {

/// Who sent a datagram.
struct Address {
    sockaddr_un socket{};
    socklen_t length = 0;

    /// False for a sender that has bound no address.
    bool canBeAnswered() const { return length > sizeof(sa_family_t); }

    /// The path; "@name" for an abstract address, empty for none.
    std::string text() const;
};

struct Datagram {
    Octets octets;
    Address from;
};

enum class SendResult { sent, full, failed };

/// Owns the descriptor and the socket file. Sending and receiving never block.
class ManagementSocket {
public:
    explicit ManagementSocket(std::string path) : path_(std::move(path)) {}
    ~ManagementSocket() { close(); }
    ManagementSocket(const ManagementSocket&) = delete;
    ManagementSocket& operator=(const ManagementSocket&) = delete;

    /// Removes what is at the path and binds there, after closing what was open.
    /// @return false on failure; errno tells why.
    bool bind();

    /// Removes the socket file; the socket stays open.
    void unbind();

    void close();

    /// -1 when closed.
    int descriptor() const { return descriptor_; }

    const std::string& path() const { return path_; }

    /// @return the next datagram, empty when there is none.
    std::optional<Datagram> receive() const;

    /// On `failed`, errno tells why. `full` is worth another attempt later.
    SendResult send(const Octets& octets, const Address& to) const;

private:
    std::string path_;
    int descriptor_ = -1;
    bool bound_ = false;
};

} // namespace simptp4l
