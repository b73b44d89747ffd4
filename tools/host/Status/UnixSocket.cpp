#include "Status/UnixSocket.h"

#include <cerrno>
#include <cstring>
#include <system_error>

#include <fmt/format.h>
#include <sys/socket.h>
#include <unistd.h>

#include "UsageError.h"

namespace vantelhost {

namespace {

int newSocket(int flags) {
    const int descriptor = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | flags, 0);
    if (descriptor < 0) {
        throw std::system_error(errno, std::system_category(), "a Unix-domain socket");
    }
    return descriptor;
}

} // namespace

sockaddr_un unixAddress(const std::string& path) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path.size() >= sizeof(address.sun_path)) {
        throw UsageError(fmt::format("the path of the socket is too long: {}", path));
    }
    std::memcpy(address.sun_path, path.data(), path.size());
    return address;
}

UnixSocket::UnixSocket() : UnixSocket(newSocket(SOCK_NONBLOCK)) {}

UnixSocket::UnixSocket(std::chrono::seconds patience) : UnixSocket(newSocket(0)) {
    timeval time{};
    time.tv_sec = patience.count();
    if (::setsockopt(descriptor_, SOL_SOCKET, SO_SNDTIMEO, &time, sizeof(time)) != 0) {
        throw std::system_error(errno, std::system_category(), "a Unix-domain socket");
    }
}

UnixSocket::~UnixSocket() {
    ::close(descriptor_);
}

int UnixSocket::connectTo(const std::string& path) const {
    const sockaddr_un address = unixAddress(path);
    return ::connect(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address));
}

int UnixSocket::bindTo(const std::string& path) const {
    const sockaddr_un address = unixAddress(path);
    return ::bind(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address));
}

} // namespace vantelhost
