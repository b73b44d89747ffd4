/// @file
#pragma once

#include <optional>
#include <string>

#include <sys/socket.h>

namespace vantelhost {

/// Where to listen for connections over TCP.
struct ListenAddress {
    std::string host; ///< an IPv4 address, or an IPv6 address in brackets
    int port;         ///< 0: one that is free
    sockaddr_storage socketAddress;
    socklen_t size;

    std::string text() const { return host + ":" + std::to_string(port); }
};

/// @param text "ADDRESS:PORT" or "[ADDRESS]:PORT", of IPv4 and IPv6; names of hosts are none.
std::optional<ListenAddress> parseListenAddress(const std::string& text);

/// Why nobody could listen there now; empty when one can.
std::string listeningProblem(const ListenAddress& address);

} // namespace vantelhost
