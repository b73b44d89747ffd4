#include "support/DatagramSocket.h"

#include <cerrno>
#include <cstring>
#include <stdexcept>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace {

sockaddr_un addressOf(const std::string& path) {
    sockaddr_un address{};
    if (path.size() > sizeof(address.sun_path)) {
        throw std::invalid_argument("no socket has a path as long as this");
    }
    address.sun_family = AF_UNIX;
    path.copy(address.sun_path, sizeof(address.sun_path));
    return address;
}

std::string pathOf(const sockaddr_un& address, socklen_t length) {
    const auto offset = offsetof(sockaddr_un, sun_path);
    if (length <= offset) {
        return "";
    }
    return {address.sun_path, strnlen(address.sun_path, sizeof(address.sun_path))};
}

const sockaddr* generic(const sockaddr_un& address) {
    return reinterpret_cast<const sockaddr*>(&address);
}

sockaddr* generic(sockaddr_un& address) {
    return reinterpret_cast<sockaddr*>(&address);
}

} // namespace

DatagramSocket::DatagramSocket() : descriptor_(socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0)) {
    if (descriptor_ < 0) {
        throw std::system_error(errno, std::generic_category(), "socket");
    }
}

DatagramSocket::DatagramSocket(const std::string& path) : DatagramSocket() {
    const sockaddr_un address = addressOf(path);
    if (bind(descriptor_, generic(address), sizeof(address)) != 0) {
        throw std::system_error(errno, std::generic_category(), "bind " + path);
    }
}

DatagramSocket::~DatagramSocket() {
    close(descriptor_);
}

bool DatagramSocket::sendTo(const std::string& path, const Octets& octets) const {
    const sockaddr_un address = addressOf(path);
    return sendto(descriptor_, octets.data(), octets.size(), 0, generic(address),
                  sizeof(address)) == static_cast<ssize_t>(octets.size());
}

void DatagramSocket::fillQueueOf(const std::string& path) const {
    const sockaddr_un address = addressOf(path);
    const char octet = 0;
    while (sendto(descriptor_, &octet, 1, MSG_DONTWAIT, generic(address), sizeof(address)) == 1) {
    }
    if (errno != EAGAIN) {
        throw std::system_error(errno, std::generic_category(), "sendto " + path);
    }
}

std::optional<DatagramSocket::Datagram>
DatagramSocket::receive(std::chrono::milliseconds deadline) const {
    pollfd readable{descriptor_, POLLIN, 0};
    if (poll(&readable, 1, static_cast<int>(deadline.count())) != 1) {
        return std::nullopt;
    }
    Octets octets(0x10000);
    sockaddr_un source{};
    socklen_t length = sizeof(source);
    const ssize_t received =
        recvfrom(descriptor_, octets.data(), octets.size(), MSG_DONTWAIT, generic(source), &length);
    if (received < 0) {
        return std::nullopt;
    }
    octets.resize(static_cast<std::size_t>(received));
    return Datagram{octets, pathOf(source, length)};
}
