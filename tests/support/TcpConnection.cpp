#include "support/TcpConnection.h"

#include <cstdint>
#include <stdexcept>

#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/time.h>

namespace {

sockaddr_in loopback(int port) {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    return address;
}

Descriptor tcpSocket() {
    return Descriptor(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
}

} // namespace

Descriptor connectTo(int port) {
    Descriptor connection = tcpSocket();
    const timeval patience{5, 0};
    ::setsockopt(connection.get(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof(patience));
    ::setsockopt(connection.get(), SOL_SOCKET, SO_SNDTIMEO, &patience, sizeof(patience));
    const sockaddr_in address = loopback(port);
    const auto* const generic = reinterpret_cast<const sockaddr*>(&address);
    if (::connect(connection.get(), generic, sizeof(address)) != 0) {
        connection.close();
    }
    return connection;
}

SilentListener::SilentListener() : socket_(tcpSocket()) {
    sockaddr_in address = loopback(0);
    auto* const generic = reinterpret_cast<sockaddr*>(&address);
    socklen_t size = sizeof(address);
    if (::bind(socket_.get(), generic, size) != 0 || ::listen(socket_.get(), 1) != 0 ||
        ::getsockname(socket_.get(), generic, &size) != 0) {
        throw std::runtime_error("nobody can listen here");
    }
    port_ = ntohs(address.sin_port);
}
