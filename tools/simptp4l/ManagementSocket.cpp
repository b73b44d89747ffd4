#include "ManagementSocket.h"

#include <cerrno>
#include <cstddef>
#include <cstring>
#include <unistd.h>

namespace simptp4l {
namespace {

sockaddr* generic(sockaddr_un& address) {
    return reinterpret_cast<sockaddr*>(&address);
}

const sockaddr* generic(const sockaddr_un& address) {
    return reinterpret_cast<const sockaddr*>(&address);
}

} // namespace

std::string Address::text() const {
    const std::size_t head = offsetof(sockaddr_un, sun_path);
    if (length <= head) {
        return {};
    }
    const std::size_t size = length - head;
    if (socket.sun_path[0] == '\0') {
        return "@" + std::string(&socket.sun_path[1], size - 1);
    }
    return {&socket.sun_path[0], strnlen(&socket.sun_path[0], size)};
}

bool ManagementSocket::bind() {
    close();
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path_.size() >= sizeof address.sun_path) {
        errno = ENAMETOOLONG;
        return false;
    }
    path_.copy(&address.sun_path[0], path_.size());
    descriptor_ = ::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
    if (descriptor_ < 0) {
        return false;
    }
    ::unlink(path_.c_str());
    bound_ = ::bind(descriptor_, generic(address), sizeof address) == 0;
    return bound_;
}

void ManagementSocket::unbind() {
    if (bound_) {
        ::unlink(path_.c_str());
    }
    bound_ = false;
}

void ManagementSocket::close() {
    unbind();
    if (descriptor_ >= 0) {
        ::close(descriptor_);
    }
    descriptor_ = -1;
}

std::optional<Datagram> ManagementSocket::receive() const {
    Datagram datagram;
    datagram.octets.resize(65536);
    datagram.from.length = sizeof datagram.from.socket;
    const ssize_t got = recvfrom(descriptor_, datagram.octets.data(), datagram.octets.size(), 0,
                                 generic(datagram.from.socket), &datagram.from.length);
    if (got < 0) {
        return std::nullopt;
    }
    datagram.octets.resize(static_cast<std::size_t>(got));
    return datagram;
}

SendResult ManagementSocket::send(const Octets& octets, const Address& to) const {
    const ssize_t sent = sendto(descriptor_, octets.data(), octets.size(),
                                MSG_DONTWAIT | MSG_NOSIGNAL, generic(to.socket), to.length);
    if (sent >= 0) {
        return SendResult::sent;
    }
    return errno == EAGAIN || errno == ENOBUFS ? SendResult::full : SendResult::failed;
}

} // namespace simptp4l
