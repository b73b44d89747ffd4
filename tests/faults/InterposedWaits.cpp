#include "InterposedWaits.h"

#include <atomic>
#include <cstring>
#include <string>

#include <sys/select.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include "support/NextFunction.h"

namespace {

std::atomic<int> selects{0};
std::atomic<int> sends{0};

/// Sockets of the tests have other names.
bool isThePlugins(int descriptor) {
    sockaddr_un address{};
    socklen_t length = sizeof(address) - 1;
    return getsockname(descriptor, reinterpret_cast<sockaddr*>(&address), &length) == 0 &&
           std::strstr(address.sun_path, "ptp4lTimeRef.") != nullptr;
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] int select(int count, fd_set* readable, fd_set* writable,
                                          fd_set* exceptional, timeval* timeout) {
    static const auto original = nextFunction<decltype(select)>("select");
    ++selects;
    return original(count, readable, writable, exceptional, timeout);
}

[[gnu::visibility("default")]] ssize_t sendto(int descriptor, const void* octets, size_t size,
                                              int flags, const sockaddr* to, socklen_t length) {
    static const auto original = nextFunction<decltype(sendto)>("sendto");
    if (isThePlugins(descriptor)) {
        ++sends;
    }
    return original(descriptor, octets, size, flags, to, length);
}

} // extern "C"

int answersAwaited() {
    return selects;
}

int requestsSent() {
    return sends;
}
