/// @file
#pragma once

#include <string>

#include <sys/un.h>

#include "iMsgAddress.h"

namespace zekelVantel {

/// The path of a Unix-domain socket, unix(7).
class tUdsMsgAddress : public iMsgAddress {
public:
    tUdsMsgAddress() = default;

    /// @param path cut silently to 107 characters, so that a zero follows.
    explicit tUdsMsgAddress(const std::string& path);

    sockaddr* receiveAddress() override;
    const sockaddr* sendAddress() const override;
    /// Always the whole structure: 110 octets.
    socklen_t length() const override;
    std::string path() const override;

    /// The path given to the constructor, as far as it is kept.
    const char* localPath() const { return address_.sun_path; }

private:
    sockaddr_un address_{AF_UNIX, {}};
};

} // namespace zekelVantel
