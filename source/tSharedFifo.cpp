#include "tSharedFifo.h"

#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "errors/ErrnoText.h"
#include "errors/Exception.h"
#include "errors/Trace.h"

namespace zekelVantel {
namespace {

/// pipe(7): what a pipe holds unless it was resized.
constexpr std::size_t defaultCapacity = 65536;

} // namespace

tSharedFifo::tSharedFifo(std::string path, bool owner, zeerr::Status& status)
    : path_(std::move(path)), owner_(owner) {
    if (zeerr::isError(status) || !owner_) {
        return;
    }
    unlink(path_.c_str());
    if (mkfifo(path_.c_str(), 0600) != 0) {
        const zeerr::ErrnoText error;
        zeerr::setErrorWithInfo(status, zeerr::site::fifoCreationFailed,
                                "Failed creating shared FIFO: %s, errno: %d (%s)", path_.c_str(),
                                error.number(), error.text());
    }
}

tSharedFifo::~tSharedFifo() {
    close();
    if (owner_ && unlink(path_.c_str()) != 0) {
        const zeerr::ErrnoText error;
        zesdbg::trace(zesdbg::levelFailure, {"tSharedFifo", __LINE__, "\n"},
                      "Failed unlinking shared FIFO: %s, errno: %d (%s)", path_.c_str(),
                      error.number(), error.text());
    }
}

void tSharedFifo::open(zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    // [oddity fifo-ends] The owner opens for writing too: its end then never reads as if the other
    // had gone. A terminal that a stranger put at the path must not become the host's.
    const int descriptor =
        ::open(path_.c_str(), (owner_ ? O_RDWR : O_RDONLY) | O_NONBLOCK | O_NOCTTY);
    if (descriptor < 0) {
        const zeerr::ErrnoText error;
        const zeerr::ErrorSite& site =
            error.number() == ENOENT ? zeerr::site::fifoNotFound : zeerr::site::fifoOpenFailed;
        zeerr::setErrorWithInfo(status, site, "Failed opening shared FIFO: %s, errno: %d (%s)",
                                path_.c_str(), error.number(), error.text());
        return;
    }
    descriptor_ = tFileDescriptor(descriptor);
}

ssize_t tSharedFifo::read(void* buffer, std::size_t length, zeerr::Status& status) {
    if (!isOpen()) {
        open(status);
    }
    if (zeerr::isError(status)) {
        return -1;
    }
    const ssize_t octets = ::read(descriptor_.get(), buffer, length);
    if (octets < 0) {
        const zeerr::ErrnoText error;
        const zeerr::ErrorSite& site =
            error.number() == EAGAIN ? zeerr::site::fifoEmpty : zeerr::site::fifoReadFailed;
        zeerr::setErrorWithInfo(status, site, "Failed reading from shared FIFO: %s, errno: %d (%s)",
                                path_.c_str(), error.number(), error.text());
    }
    return octets;
}

ssize_t tSharedFifo::write(const void* buffer, std::size_t length, zeerr::Status& status) {
    if (!isOpen()) {
        open(status);
    }
    if (zeerr::isError(status)) {
        return -1;
    }
    const ssize_t octets = ::write(descriptor_.get(), buffer, length);
    if (octets < 0) {
        const zeerr::ErrnoText error;
        zeerr::setErrorWithInfo(status, zeerr::site::fifoWriteFailed,
                                "Failed writing to shared FIFO: %s, errno: %d (%s)", path_.c_str(),
                                error.number(), error.text());
    }
    return octets;
}

std::size_t tSharedFifo::capacity() const {
    const int octets = fcntl(descriptor_.get(), F_GETPIPE_SZ);
    return octets > 0 ? static_cast<std::size_t>(octets) : defaultCapacity;
}

void tSharedFifo::close() {
    if (descriptor_.close() != 0) {
        const zeerr::ErrnoText error;
        zesdbg::trace(zesdbg::levelFailure, {"tSharedFifo", __LINE__, "\n"},
                      "Failed closing shared FIFO: %s, errno: %d (%s)", path_.c_str(),
                      error.number(), error.text());
    }
}

} // namespace zekelVantel
