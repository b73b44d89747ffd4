#include "EpochFifo.h"

#include <cerrno>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

[[noreturn]] void refuse(const char* what, const std::string& path, int number) {
    throw UsageError(fmt::format("cannot {} the epoch FIFO {}: {}", what, path, errorText(number)));
}

[[noreturn]] void refuseNoFifo(const std::string& path) {
    throw UsageError(fmt::format("{} is not a FIFO; it is left as it is", path));
}

} // namespace

EpochFifo::EpochFifo(std::string path, Absent absent, Use use)
    : path_(std::move(path)), created_(absent == Absent::create && create()) {
    try {
        descriptor_ = open(use);
    } catch (...) {
        if (created_) {
            ::unlink(path_.c_str());
        }
        throw;
    }
}

EpochFifo::~EpochFifo() {
    if (created_) {
        remove();
    }
    ::close(descriptor_);
}

void EpochFifo::write(std::int64_t nanoseconds) {
    // Eight octets go into a FIFO whole or not at all.
    if (::write(descriptor_, &nanoseconds, sizeof(nanoseconds)) < 0) {
        throw std::system_error(errno, std::system_category(), path_);
    }
}

bool EpochFifo::create() const {
    if (::mkfifo(path_.c_str(), 0600) == 0) {
        return true;
    }
    if (errno != EEXIST) {
        refuse("create", path_, errno);
    }
    return false;
}

int EpochFifo::open(Use use) const {
    struct stat named {};
    if (::lstat(path_.c_str(), &named) != 0) {
        refuse("open", path_, errno);
    }
    // Looked at before it is opened: opening a device may do something.
    if (!S_ISFIFO(named.st_mode)) {
        refuseNoFifo(path_);
    }
    const int descriptor = openFor(use);
    if (descriptor < 0) {
        refuse("open", path_, errno);
    }
    struct stat opened {};
    if (::fstat(descriptor, &opened) != 0 || !S_ISFIFO(opened.st_mode)) {
        ::close(descriptor);
        refuseNoFifo(path_);
    }
    return descriptor;
}

/// As open() answers.
int EpochFifo::openFor(Use use) const {
    constexpr int flags = O_NONBLOCK | O_CLOEXEC | O_NOFOLLOW;
    const int descriptor = ::open(path_.c_str(), O_RDWR | flags);
    if (descriptor >= 0 || errno != EACCES || use == Use::write) {
        return descriptor;
    }
    return ::open(path_.c_str(), O_RDONLY | flags);
}

void EpochFifo::remove() const {
    struct stat named {};
    struct stat opened {};
    if (::lstat(path_.c_str(), &named) == 0 && ::fstat(descriptor_, &opened) == 0 &&
        named.st_dev == opened.st_dev && named.st_ino == opened.st_ino) {
        ::unlink(path_.c_str());
    }
}

} // namespace vantelhost
