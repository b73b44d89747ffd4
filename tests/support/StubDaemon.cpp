#include "support/StubDaemon.h"

#include <sys/socket.h>
#include <sys/un.h>

namespace {

constexpr std::uint64_t clockIdentity = 0xAABBCCFFFEDDEEFF;
constexpr std::size_t offsetOfManagementId = 52;

/// An answer under construction, in network byte order.
class Answer {
public:
    Answer(std::uint16_t port, std::uint16_t managementId, std::size_t dataOctets) {
        const std::size_t padded = dataOctets + dataOctets % 2;
        add(1, 0x0D).add(1, 2).add(2, 48 + 6 + padded).add(16, 0); // up to the second reserved
        add(8, clockIdentity).add(2, port).add(2, 0).add(1, 4).add(1, 0x7F);
        add(8, 0).add(2, 1).add(2, 0).add(1, 2).add(1, 0); // to port 1: RESPONSE
        add(2, 1).add(2, 2 + padded).add(2, managementId);
        length_ = octets_.size() + padded;
    }

    Answer& add(std::size_t octets, std::uint64_t value) {
        for (std::size_t left = octets; left > 0; --left) {
            const std::uint64_t shifted = left > 8 ? 0 : value >> 8 * (left - 1);
            octets_.push_back(static_cast<std::uint8_t>(shifted & 0xFF));
        }
        return *this;
    }

    Answer& add(const std::string& text) {
        add(1, text.size());
        octets_.insert(octets_.end(), text.begin(), text.end());
        return *this;
    }

    Octets finished() {
        octets_.resize(length_);
        return octets_;
    }

private:
    Octets octets_;
    std::size_t length_ = 0;
};

Octets timeStatus() {
    Answer answer(1, 0xC000, 50);
    answer.add(8, 0xFFFFFFFFFFFFFFD6).add(8, 0x1122334455667788).add(4, 3).add(4, 4).add(2, 5);
    answer.add(2, 0).add(8, 6).add(2, 7).add(4, 1).add(8, 0x0102030405060708);
    return answer.finished();
}

Octets parentDataSet() {
    Answer answer(1, 0x2002, 32);
    answer.add(8, 0x0102030405060708).add(2, 1).add(1, 0).add(1, 0).add(2, 0xFFFF);
    answer.add(4, 0x7FFFFFFF).add(1, 10).add(1, 6).add(1, 0x21).add(2, 0x4E5D).add(1, 128);
    answer.add(8, 0x0102030405060708);
    return answer.finished();
}

Octets defaultDataSet(std::uint16_t ports) {
    Answer answer(1, 0x2000, 20);
    answer.add(1, 1).add(1, 0).add(2, ports).add(1, 128).add(1, 248).add(1, 0xFE).add(2, 0xFFFF);
    answer.add(1, 128).add(8, clockIdentity).add(1, 24).add(1, 0);
    return answer.finished();
}

Octets portDataSet(std::uint16_t port) {
    Answer answer(port, 0x2004, 26);
    answer.add(8, clockIdentity).add(2, port).add(1, 9).add(1, 0).add(8, 0x10000);
    answer.add(1, 1).add(1, 3).add(1, 0xFD).add(1, 1).add(1, 0).add(1, 2);
    return answer.finished();
}

Octets portDataSetNp(std::uint16_t port) {
    return Answer(port, 0xC002, 8).add(4, 20000000U + port).add(4, 1).finished();
}

Octets portProperties(std::uint16_t port) {
    const std::string name = "bc" + std::to_string(port - 1);
    Answer answer(port, 0xC004, 13 + name.size());
    answer.add(8, clockIdentity).add(2, port).add(1, 9).add(1, 0).add(name);
    return answer.finished();
}

} // namespace

StubDaemon::StubDaemon(const std::string& path, std::uint16_t ports) : path_(path), socket_(path) {
    answers_[0xC000] = {timeStatus()};
    answers_[0x2002] = {parentDataSet()};
    answers_[0x2000] = {defaultDataSet(ports)};
    for (std::uint16_t port = 1; port <= ports; ++port) {
        answers_[0x2004].push_back(portDataSet(port));
        answers_[0xC002].push_back(portDataSetNp(port));
        answers_[0xC004].push_back(portProperties(port));
    }
    thread_ = std::thread(&StubDaemon::run, this);
}

StubDaemon::~StubDaemon() {
    DatagramSocket().sendTo(path_, {});
    thread_.join();
}

const std::vector<Octets>& StubDaemon::answersTo(std::uint16_t managementId) const {
    return answers_.at(managementId);
}

void StubDaemon::run() const {
    while (true) {
        std::uint8_t request[2048];
        sockaddr_un source{};
        socklen_t length = sizeof(source);
        auto* const address = reinterpret_cast<sockaddr*>(&source);
        const ssize_t received =
            recvfrom(socket_.descriptor(), request, sizeof(request), 0, address, &length);
        if (received < static_cast<ssize_t>(offsetOfManagementId + 2)) {
            return;
        }
        const auto managementId = static_cast<std::uint16_t>(request[offsetOfManagementId] << 8 |
                                                             request[offsetOfManagementId + 1]);
        for (const Octets& answer : answers_.at(managementId)) {
            sendto(socket_.descriptor(), answer.data(), answer.size(), 0, address, length);
        }
    }
}
