/// @file
#pragma once

#include "iMsgInterface.h"
#include "tFileDescriptor.h"
#include "tUdsMsgAddress.h"

namespace zekelVantel {

/// Datagrams over a Unix-domain socket that is bound to a path of its own.
///
/// Errors: -52031 opened twice; -52000 no socket; -52006 not bound; -52010 used while closed;
/// -52024 not sent whole, or within 2000 ms, or not received; -52007 nothing to receive in time. A
/// signal that interrupts the waiting counts as a time-out.
class tUdsMsgInterface : public iMsgInterface {
public:
    tUdsMsgInterface() = default;
    ~tUdsMsgInterface() override;
    tUdsMsgInterface(const tUdsMsgInterface&) = delete;
    tUdsMsgInterface& operator=(const tUdsMsgInterface&) = delete;

    /// Binds the path, after removing what a former run left there.
    void open(const std::string& localPath, zeerr::Status& status) override;

    /// Removes the path and closes the socket.
    int close() override;
    bool isOpen() const override { return socket_.isOpen(); }
    void send(const tMsgBuffer& buffer, const iMsgAddress& remoteAddress,
              zeerr::Status& status) override;
    void receive(tMsgBuffer& buffer, std::uint32_t timeoutMs, zeerr::Status& status) override;
    void receive(tMsgBuffer& buffer, iMsgAddress& sourceAddress, std::uint32_t timeoutMs,
                 zeerr::Status& status) override;

private:
    /// @param source,sourceLength both null: it is not asked for.
    void receiveFrom(sockaddr* source, socklen_t* sourceLength, tMsgBuffer& buffer,
                     std::uint32_t timeoutMs, zeerr::Status& status);
    bool waitForDatagram(std::uint32_t timeoutMs) const;

    tFileDescriptor socket_;
    tUdsMsgAddress localAddress_;
};

} // namespace zekelVantel
