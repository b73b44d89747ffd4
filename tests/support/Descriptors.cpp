#include "support/Descriptors.h"

#include <algorithm>
#include <cstring>
#include <filesystem>

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

int openDescriptors() {
    const std::filesystem::directory_iterator descriptors("/proc/self/fd");
    // One of them was the folder itself, while it was read.
    return static_cast<int>(std::distance(begin(descriptors), end(descriptors))) - 1;
}

int descriptorBoundTo(const std::string& path) {
    const auto limit = static_cast<int>(sysconf(_SC_OPEN_MAX));
    for (int descriptor = 0; descriptor < limit; ++descriptor) {
        sockaddr_un address{};
        socklen_t length = sizeof(address);
        if (getsockname(descriptor, reinterpret_cast<sockaddr*>(&address), &length) == 0 &&
            address.sun_family == AF_UNIX &&
            path.compare(0, std::string::npos, address.sun_path,
                         strnlen(address.sun_path, sizeof(address.sun_path))) == 0) {
            return descriptor;
        }
    }
    return -1;
}

DescriptorLimit::DescriptorLimit(rlim_t limit) {
    getrlimit(RLIMIT_NOFILE, &before_);
    const rlimit changed{std::min(limit, before_.rlim_max), before_.rlim_max};
    setrlimit(RLIMIT_NOFILE, &changed);
}

DescriptorLimit::~DescriptorLimit() {
    setrlimit(RLIMIT_NOFILE, &before_);
}

FreeDescriptorZero::FreeDescriptorZero() : before_(dup(STDIN_FILENO)) {
    close(STDIN_FILENO);
}

FreeDescriptorZero::~FreeDescriptorZero() {
    dup2(before_, STDIN_FILENO);
    close(before_);
}

OccupiedDescriptors::OccupiedDescriptors(int below) : limit_(static_cast<rlim_t>(below) + 16) {
    for (int last = 0; last < below;) {
        last = fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 0);
        if (last < 0) {
            break;
        }
        descriptors_.push_back(last);
    }
    if (!descriptors_.empty() && descriptors_.back() >= below) {
        close(descriptors_.back());
        descriptors_.pop_back();
    }
}

OccupiedDescriptors::~OccupiedDescriptors() {
    for (const int descriptor : descriptors_) {
        close(descriptor);
    }
}

bool OccupiedDescriptors::leaveRoom() const {
    const int next = dup(STDERR_FILENO);
    return next >= 0 && close(next) == 0;
}
