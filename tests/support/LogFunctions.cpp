#include "support/LogFunctions.h"

#include <atomic>
#include <cstdarg>
#include <cstdio>

#include <syslog.h>

#include "support/OwnAllocations.h"

namespace {

std::atomic<LogTaker> currentTaker{nullptr};

[[gnu::format(printf, 2, 0)]] void take(int priority, const char* format, va_list arguments) {
    const OwnAllocations own;
    char line[8192];
    std::vsnprintf(line, sizeof(line), format, arguments);
    // Relaxed: ThreadSanitizer is to see threads that nothing else orders.
    if (const LogTaker taker = currentTaker.load(std::memory_order_relaxed)) {
        taker(priority, line);
    }
}

} // namespace

void setLogTaker(LogTaker taker) {
    currentTaker.store(taker, std::memory_order_relaxed);
}

// The checked ones are what _FORTIFY_SOURCE calls: GCC the first, clang the second, where the C
// library can do it for clang, too.
extern "C" {

[[gnu::visibility("default"), gnu::format(printf, 2, 3)]] void syslog(int pri, const char* fmt,
                                                                      ...) {
    std::va_list arguments;
    va_start(arguments, fmt);
    take(pri, fmt, arguments);
    va_end(arguments);
}

// NOLINTBEGIN: names of the C library
void __syslog_chk(int pri, int flag, const char* fmt, ...);
void __vsyslog_chk(int pri, int flag, const char* fmt, va_list ap);
// NOLINTEND

[[gnu::visibility("default"), gnu::format(printf, 3, 4)]] void __syslog_chk(int pri, int /*flag*/,
                                                                            const char* fmt, ...) {
    std::va_list arguments;
    va_start(arguments, fmt);
    take(pri, fmt, arguments);
    va_end(arguments);
}

[[gnu::visibility("default"), gnu::format(printf, 3, 0)]] void
__vsyslog_chk(int pri, int /*flag*/, const char* fmt, va_list ap) {
    take(pri, fmt, ap);
}

} // extern "C"
