/// @file
#pragma once

#include <string>

#include <sys/socket.h>

namespace zekelVantel {

/// Where a datagram goes to or comes from. Slot order is part of the interface.
class iMsgAddress {
public:
    virtual ~iMsgAddress() = default;

    /// For a receive to fill.
    virtual sockaddr* receiveAddress() = 0;
    /// For a send to use.
    virtual const sockaddr* sendAddress() const = 0;
    /// Octets of the address, in both cases.
    virtual socklen_t length() const = 0;
    virtual std::string path() const = 0;

protected:
    iMsgAddress() = default;
    iMsgAddress(const iMsgAddress&) = default;
    iMsgAddress& operator=(const iMsgAddress&) = default;
};

} // namespace zekelVantel
