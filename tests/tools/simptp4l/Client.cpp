#include "Client.h"

#include <cstdint>
#include <poll.h>
#include <stdexcept>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace {

sockaddr_un addressOf(const std::string& path) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    path.copy(&address.sun_path[0], sizeof address.sun_path - 1);
    return address;
}

std::string octetsOf(const std::string& hex) {
    std::string octets;
    for (std::size_t at = 0; at + 1 < hex.size(); at += 2) {
        octets += static_cast<char>(std::stoi(hex.substr(at, 2), nullptr, 16));
    }
    return octets;
}

std::string hexOf(const std::string& octets) {
    constexpr char digits[] = "0123456789abcdef";
    std::string hex;
    for (char octet : octets) {
        hex += digits[static_cast<std::uint8_t>(octet) >> 4];
        hex += digits[static_cast<std::uint8_t>(octet) & 0x0F];
    }
    return hex;
}

std::string zeros(std::size_t octets) {
    return std::string(2 * octets, '0');
}

} // namespace

namespace requests {

std::string head(const std::string& length, const std::string& sequence,
                 const std::string& target) {
    return "0d02" + length + zeros(16) + zeros(8) + "0001" + sequence + "047f" + target + zeros(4);
}

std::string timeStatus(const std::string& sequence) {
    return head("0068", sequence) + "00010034c000" + zeros(50);
}

std::string parentDataSet() {
    return head("0056") + "000100222002" + zeros(32);
}

std::string defaultDataSet() {
    return head("004a") + "000100162000" + zeros(20);
}

std::string portDataSet(const std::string& target) {
    return head("0050", "0000", target) + "0001001c2004" + zeros(26);
}

std::string portDataSetNp() {
    return head("003e") + "0001000ac002" + zeros(8);
}

std::string portProperties(const std::string& length) {
    return head(length) + "00010010c004" + zeros(14);
}

} // namespace requests

Client::Client(const std::string& path, const std::string& daemon)
    : path_(path), daemon_(daemon), descriptor_(socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0)) {
    const sockaddr_un address = addressOf(path);
    unlink(path.c_str());
    if (bind(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
        throw std::runtime_error("cannot bind " + path);
    }
}

Client::~Client() {
    close(descriptor_);
    unlink(path_.c_str());
}

bool Client::send(const std::string& hex) const {
    const std::string octets = octetsOf(hex);
    const sockaddr_un address = addressOf(daemon_);
    return sendto(descriptor_, octets.data(), octets.size(), 0,
                  reinterpret_cast<const sockaddr*>(&address),
                  sizeof address) == static_cast<ssize_t>(octets.size());
}

std::string Client::receive() const {
    pollfd polled{descriptor_, POLLIN, 0};
    if (poll(&polled, 1, 10000) != 1) {
        return "none";
    }
    std::string octets(65536, '\0');
    const ssize_t got = recv(descriptor_, octets.data(), octets.size(), 0);
    octets.resize(got < 0 ? 0 : static_cast<std::size_t>(got));
    return hexOf(octets);
}

std::vector<std::string> Client::receive(unsigned count) const {
    std::vector<std::string> answers;
    while (answers.size() < count) {
        answers.push_back(receive());
    }
    return answers;
}

bool Client::isQuiet() const {
    pollfd polled{descriptor_, POLLIN, 0};
    return poll(&polled, 1, 0) == 0;
}

std::string Client::ask(const std::string& hex) const {
    return send(hex) ? receive() : "unreachable";
}
