#include "support/Http.h"

#include <array>
#include <cstdio>
#include <string_view>

#include <sys/socket.h>

#include "support/TcpConnection.h"

namespace {

std::string answerTo(const std::string& request, int port) {
    const Descriptor connection = connectTo(port);
    std::string answer;
    if (::send(connection.get(), request.data(), request.size(), MSG_NOSIGNAL) < 0) {
        return answer;
    }
    std::array<char, 4096> part{};
    ssize_t size = 0;
    while ((size = ::recv(connection.get(), part.data(), part.size(), 0)) > 0) {
        answer.append(part.data(), static_cast<std::size_t>(size));
    }
    return answer;
}

bool isUnreserved(char character) {
    constexpr std::string_view others = "-._~";
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           (character >= '0' && character <= '9') ||
           others.find(character) != std::string_view::npos;
}

} // namespace

std::string httpGet(int port, const std::string& target) {
    // Of this version an answer ends with the connection, and is in one piece.
    const std::string answer = answerTo("GET " + target + " HTTP/1.0\r\n\r\n", port);
    const auto end = answer.find("\r\n\r\n");
    const bool isGood = answer.find(" 200 ") < answer.find("\r\n");
    return isGood && end != std::string::npos ? answer.substr(end + 4) : "";
}

std::string percentEncoded(const std::string& text) {
    std::string encoded;
    for (const char character : text) {
        std::array<char, 4> octet{character, '\0'};
        if (!isUnreserved(character)) {
            std::snprintf(octet.data(), octet.size(), "%%%02X",
                          static_cast<unsigned>(static_cast<unsigned char>(character)));
        }
        encoded += octet.data();
    }
    return encoded;
}
