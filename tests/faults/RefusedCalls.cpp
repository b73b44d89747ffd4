// The functions of both sizes of files stand here under their own names.
#undef _FILE_OFFSET_BITS

#include "RefusedCalls.h"

#include <atomic>
#include <cerrno>
#include <cstdarg>

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

std::atomic<int> refusal{0};

/// The first thread is that of the tests.
bool isRefused() {
    if (refusal == 0 || gettid() == getpid()) {
        return false;
    }
    errno = refusal;
    return true;
}

int openUnlessRefused(const char* path, int flags, std::va_list arguments) {
    const int mode = (flags & O_CREAT) != 0 ? va_arg(arguments, int) : 0;
    return isRefused() ? -1 : static_cast<int>(syscall(SYS_openat, AT_FDCWD, path, flags, mode));
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] int socket(int domain, int type, int protocol) noexcept {
    return isRefused() ? -1 : static_cast<int>(syscall(SYS_socket, domain, type, protocol));
}

[[gnu::visibility("default")]] int open(const char* path, int flags, ...) {
    std::va_list arguments;
    va_start(arguments, flags);
    const int descriptor = openUnlessRefused(path, flags, arguments);
    va_end(arguments);
    return descriptor;
}

[[gnu::visibility("default")]] int open64(const char* path, int flags, ...) {
    std::va_list arguments;
    va_start(arguments, flags);
    const int descriptor = openUnlessRefused(path, flags | O_LARGEFILE, arguments);
    va_end(arguments);
    return descriptor;
}

// What _FORTIFY_SOURCE calls where flags that are no constant might ask for a mode.
// NOLINTNEXTLINE: a name of the C library
int __open_2(const char* path, int flags);

[[gnu::visibility("default")]] int __open_2(const char* path, int flags) {
    return open(path, flags);
}

} // extern "C"

RefusedCalls::RefusedCalls(int error) {
    refusal = error;
}

RefusedCalls::~RefusedCalls() {
    refusal = 0;
}
