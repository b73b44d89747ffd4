/// @file
#pragma once

#include <string>

#include <sys/un.h>

#include "iMsgAddress.h"

namespace zekelVantel {

/// The path of a Unix-domain socket, unix(7).
class tUdsMsgAddress : public iMsgAddress {
public:
    /// @param path cut silently to 107 characters, so that a zero follows.
    explicit tUdsMsgAddress(const std::string& path);

    sockaddr* receiveAddress() override;
    const sockaddr* sendAddress() const override;
    /// Always the whole structure: 110 octets.
    socklen_t length() const override;
    std::string path() const override;

private:
    sockaddr_un address_{};
};

} // namespace zekelVantel
