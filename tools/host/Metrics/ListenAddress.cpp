#include "Metrics/ListenAddress.h"

#include <cerrno>
#include <cstdint>
#include <cstring>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <unistd.h>

#include "Numbers.h"
#include "Text.h"

namespace vantelhost {

namespace {

std::optional<std::uint16_t> parsePort(const std::string& text) {
    const auto number = parseInteger(text);
    if (!number || *number < 0 || *number > UINT16_MAX) {
        return std::nullopt;
    }
    return static_cast<std::uint16_t>(*number);
}

bool isBracketed(const std::string& host) {
    return host.size() > 2 && host.front() == '[' && host.back() == ']';
}

/// Fills the family and the address.
bool readHost(ListenAddress& address, std::uint16_t port) {
    void* const memory = &address.socketAddress;
    if (isBracketed(address.host)) {
        auto* const ipv6 = static_cast<sockaddr_in6*>(memory);
        ipv6->sin6_family = AF_INET6;
        ipv6->sin6_port = htons(port);
        address.size = sizeof(*ipv6);
        const std::string bare = address.host.substr(1, address.host.size() - 2);
        return ::inet_pton(AF_INET6, bare.c_str(), &ipv6->sin6_addr) == 1;
    }
    auto* const ipv4 = static_cast<sockaddr_in*>(memory);
    ipv4->sin_family = AF_INET;
    ipv4->sin_port = htons(port);
    address.size = sizeof(*ipv4);
    return ::inet_pton(AF_INET, address.host.c_str(), &ipv4->sin_addr) == 1;
}

} // namespace

std::optional<ListenAddress> parseListenAddress(const std::string& text) {
    const auto colon = text.rfind(':');
    if (colon == std::string::npos) {
        return std::nullopt;
    }
    const auto port = parsePort(text.substr(colon + 1));
    if (!port) {
        return std::nullopt;
    }
    ListenAddress address{text.substr(0, colon), *port, {}, 0};
    return readHost(address, *port) ? std::optional(address) : std::nullopt;
}

std::string listeningProblem(const ListenAddress& address) {
    const int family = address.socketAddress.ss_family;
    const int descriptor = ::socket(family, SOCK_STREAM | SOCK_CLOEXEC, 0);
    if (descriptor < 0) {
        return errorText(errno);
    }
    // As servers do: connections of a former one may still linger.
    const int on = 1;
    ::setsockopt(descriptor, SOL_SOCKET, SO_REUSEADDR, &on, sizeof(on));
    const void* const memory = &address.socketAddress;
    const bool works =
        ::bind(descriptor, static_cast<const sockaddr*>(memory), address.size) == 0 &&
        ::listen(descriptor, 1) == 0;
    std::string problem = works ? "" : errorText(errno);
    ::close(descriptor);
    return problem;
}

} // namespace vantelhost
