#include "support/SystemClock.h"

#include <ctime>
#include <optional>

#include <sys/syscall.h>
#include <unistd.h>

namespace {

std::optional<std::int64_t> realtime;

long askSystem(clockid_t clock, timespec* time) {
#ifdef SYS_clock_gettime64 // where that without the number has 32-bit seconds
    return syscall(SYS_clock_gettime64, clock, time);
#else
    return syscall(SYS_clock_gettime, clock, time);
#endif
}

} // namespace

extern "C" [[gnu::visibility("default")]] int clock_gettime(clockid_t id, timespec* tp) noexcept {
    if (id != CLOCK_REALTIME || !realtime) {
        return static_cast<int>(askSystem(id, tp));
    }
    tp->tv_sec = *realtime / 1000000000;
    tp->tv_nsec = static_cast<decltype(tp->tv_nsec)>(*realtime % 1000000000);
    return 0;
}

StoppedRealtime::StoppedRealtime(std::int64_t nanoseconds) {
    realtime = nanoseconds;
}

StoppedRealtime::~StoppedRealtime() {
    realtime.reset();
}
