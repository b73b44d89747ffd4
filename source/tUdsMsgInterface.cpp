#include "tUdsMsgInterface.h"

#include <sys/select.h>
#include <sys/time.h>
#include <unistd.h>

#include "errors/ErrnoText.h"
#include "errors/Exception.h"

namespace zekelVantel {
namespace {

constexpr std::uint32_t sendTimeoutMs = 2000;

timeval toTimeval(std::uint32_t milliseconds) {
    timeval time{};
    time.tv_sec = static_cast<decltype(time.tv_sec)>(milliseconds / 1000);
    time.tv_usec = static_cast<decltype(time.tv_usec)>(milliseconds % 1000 * 1000);
    return time;
}

} // namespace

tUdsMsgInterface::~tUdsMsgInterface() {
    tUdsMsgInterface::close();
}

void tUdsMsgInterface::open(const std::string& localPath, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (isOpen()) {
        zeerr::setError(status, zeerr::site::socketAlreadyOpen);
        return;
    }
    const int descriptor = socket(AF_UNIX, SOCK_DGRAM, 0);
    if (descriptor < 0) {
        const zeerr::ErrnoText error;
        zeerr::setErrorWithInfo(status, zeerr::site::socketFailed,
                                "Failed to open socket with errno %d (%s)", error.number(),
                                error.text());
        return;
    }
    socket_ = tFileDescriptor(descriptor);
    // A stopped ptp4l does not read: without a limit, a send would then never return.
    const timeval timeout = toTimeval(sendTimeoutMs);
    setsockopt(socket_.get(), SOL_SOCKET, SO_SNDTIMEO, &timeout, sizeof(timeout));
    // [oddity stale-path] Whatever stands at the path goes: it is ours by name, left by a former
    // run.
    localAddress_ = tUdsMsgAddress(localPath);
    unlink(localAddress_.localPath());
    if (bind(socket_.get(), localAddress_.sendAddress(), localAddress_.length()) != 0) {
        const zeerr::ErrnoText error;
        zeerr::setErrorWithInfo(status, zeerr::site::bindFailed,
                                "Failed to bind socket with errno %d (%s)", error.number(),
                                error.text());
        socket_.close();
    }
}

int tUdsMsgInterface::close() {
    if (!socket_.isOpen()) { // and not isOpen(): the destructor comes here
        return 0;
    }
    unlink(localAddress_.localPath());
    return socket_.close();
}

void tUdsMsgInterface::send(const tMsgBuffer& buffer, const iMsgAddress& remoteAddress,
                            zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (!socket_.isOpen()) {
        zeerr::setError(status, zeerr::site::sendWhileClosed);
        return;
    }
    const ssize_t sent = sendto(socket_.get(), buffer.data(), buffer.getLength(), 0,
                                remoteAddress.sendAddress(), remoteAddress.length());
    if (sent != static_cast<ssize_t>(buffer.getLength())) {
        zeerr::setError(status, zeerr::site::sendFailed);
    }
}

void tUdsMsgInterface::receive(tMsgBuffer& buffer, std::uint32_t timeoutMs, zeerr::Status& status) {
    receiveFrom(nullptr, nullptr, buffer, timeoutMs, status);
}

void tUdsMsgInterface::receive(tMsgBuffer& buffer, iMsgAddress& sourceAddress,
                               std::uint32_t timeoutMs, zeerr::Status& status) {
    socklen_t length = sourceAddress.length();
    receiveFrom(sourceAddress.receiveAddress(), &length, buffer, timeoutMs, status);
}

void tUdsMsgInterface::receiveFrom(sockaddr* source, socklen_t* sourceLength, tMsgBuffer& buffer,
                                   std::uint32_t timeoutMs, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (!socket_.isOpen()) {
        zeerr::setError(status, zeerr::site::receiveWhileClosed);
        return;
    }
    if (!waitForDatagram(timeoutMs)) {
        zeerr::setError(status, zeerr::site::receiveTimedOut);
        return;
    }
    const auto receiveOne = [&](std::uint8_t* octets, std::uint32_t capacity) {
        return recvfrom(socket_.get(), octets, capacity, 0, source, sourceLength);
    };
    if (buffer.fill(receiveOne, status) < 0) {
        zeerr::setError(status, zeerr::site::receiveFailed);
    }
}

bool tUdsMsgInterface::waitForDatagram(std::uint32_t timeoutMs) const {
    // The set has room for descriptors below FD_SETSIZE; a host may have more open than that.
    if (socket_.get() >= FD_SETSIZE) {
        return false;
    }
    fd_set readable;
    FD_ZERO(&readable);
    FD_SET(socket_.get(), &readable);
    timeval timeout = toTimeval(timeoutMs);
    // [oddity signal-is-timeout] An interrupted wait is not resumed: the next poll asks again
    // anyway.
    return select(socket_.get() + 1, &readable, nullptr, nullptr, &timeout) >= 1;
}

} // namespace zekelVantel
