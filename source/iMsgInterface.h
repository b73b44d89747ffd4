/// @file
#pragma once

#include <cstdint>
#include <string>

#include "errors/Status.h"
#include "iMsgAddress.h"
#include "tMsgBuffer.h"

namespace zekelVantel {

/// Exchanges datagrams. Operations that get a status with an error do nothing. Slot order is part
/// of the interface.
class iMsgInterface {
public:
    virtual ~iMsgInterface() = default;

    virtual void open(const std::string& localPath, zeerr::Status& status) = 0;

    /// @return what close(2) returned; 0 when it was not open.
    virtual int close() = 0;
    virtual bool isOpen() const = 0;

    /// Sends the octets of the buffer up to its length.
    virtual void send(const tMsgBuffer& buffer, const iMsgAddress& remoteAddress,
                      zeerr::Status& status) = 0;

    /// Waits for one datagram, at most `timeoutMs` milliseconds, and sets the length of the buffer.
    /// The buffer is to be cleared before.
    virtual void receive(tMsgBuffer& buffer, std::uint32_t timeoutMs, zeerr::Status& status) = 0;

    /// As above, and tells where the datagram came from.
    virtual void receive(tMsgBuffer& buffer, iMsgAddress& sourceAddress, std::uint32_t timeoutMs,
                         zeerr::Status& status) = 0;

protected:
    iMsgInterface() = default;
    iMsgInterface(const iMsgInterface&) = default;
    iMsgInterface& operator=(const iMsgInterface&) = default;
};

} // namespace zekelVantel
