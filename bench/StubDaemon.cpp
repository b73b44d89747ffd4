#include "StubDaemon.h"

#include <sys/socket.h>
#include <sys/un.h>

#include "support/FakePtp4l.h"

namespace {

constexpr std::size_t offsetOfManagementId = 52;

Octets requestFor(std::uint16_t managementId) {
    Octets request(offsetOfManagementId + 2);
    request[offsetOfManagementId] = static_cast<std::uint8_t>(managementId >> 8);
    request[offsetOfManagementId + 1] = static_cast<std::uint8_t>(managementId & 0xFF);
    return request;
}

} // namespace

StubDaemon::StubDaemon(const std::string& path, std::uint16_t ports) : socket_(path) {
    for (const std::uint16_t managementId :
         {FakePtp4l::timeStatusNp, FakePtp4l::parentDataSet, FakePtp4l::defaultDataSet,
          FakePtp4l::portDataSet, FakePtp4l::portDataSetNp, FakePtp4l::portPropertiesNp}) {
        answers_[managementId] = FakePtp4l::answersTo({requestFor(managementId), {}}, ports);
    }
    thread_ = std::thread(&StubDaemon::run, this);
}

StubDaemon::~StubDaemon() {
    shutdown(socket_.descriptor(), SHUT_RDWR);
    thread_.join();
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
