#include "Status/UnixSocket.h"

#include <cerrno>
#include <cstring>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <sys/socket.h>
#include <unistd.h>

#include "UsageError.h"

namespace vantelhost {

sockaddr_un unixAddress(const std::string& path) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path.size() >= sizeof(address.sun_path)) {
        throw UsageError(fmt::format("the path of the socket is too long: {}", path));
    }
    std::memcpy(address.sun_path, path.data(), path.size());
    return address;
}

UnixSocket::UnixSocket()
    : descriptor_(::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0)) {
    if (descriptor_ < 0) {
        throw std::system_error(errno, std::system_category(), "a Unix-domain socket");
    }
}

UnixSocket::~UnixSocket() {
    if (descriptor_ >= 0) {
        ::close(descriptor_);
    }
}

int UnixSocket::connectTo(const std::string& path) const {
    const sockaddr_un address = unixAddress(path);
    return ::connect(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address));
}

int UnixSocket::bindTo(const std::string& path) const {
    const sockaddr_un address = unixAddress(path);
    return ::bind(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address));
}

int UnixSocket::release() {
    return std::exchange(descriptor_, -1);
}

} // namespace vantelhost
