#include "FastWaits.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <ctime>
#include <limits>

#include <pthread.h>
#include <sys/select.h>
#include <sys/socket.h>
#include <sys/syscall.h>
#include <sys/time.h>
#include <unistd.h>

#include "support/NextFunction.h"
#include "support/NextThreadCreation.h"
#include "support/Processes.h"

namespace {

using std::chrono::microseconds;
using std::chrono::milliseconds;
using std::chrono::nanoseconds;

constexpr int faster = 100;
/// Of answers: a daemon needs its time. On a busy machine it needs more: each answer that does not
/// come makes the wait for the next ones longer.
constexpr int fasterAnswers = 40;
constexpr int mostTimesAsLong = 16;

/// Between two looks at a daemon that is to end.
constexpr milliseconds grace{10};

constexpr microseconds moment{100};
constexpr int unlimited = std::numeric_limits<int>::max();

std::atomic<int> waiting{0};
std::atomic<bool> isWithoutGrace{false};
std::atomic<int> threadsAllowed{unlimited};
std::atomic<int> timesAsLong{1};

class Waiting {
public:
    Waiting() { waiting.fetch_add(1, std::memory_order_relaxed); }
    ~Waiting() { waiting.fetch_sub(1, std::memory_order_relaxed); }
    Waiting(const Waiting&) = delete;
    Waiting& operator=(const Waiting&) = delete;
};

int sleepFor(nanoseconds duration, timespec* rest = nullptr) {
    timespec time{};
    time.tv_nsec = static_cast<decltype(time.tv_nsec)>(duration.count());
    return static_cast<int>(syscall(SYS_nanosleep, &time, rest));
}

void awaitDeadChild(nanoseconds longest) {
    for (nanoseconds waited{0}; waited < longest && !hasDeadChild(); waited += moment) {
        sleepFor(moment);
    }
}

timeval shortened(const timeval& time, int times = 1) {
    const auto whole = std::chrono::seconds(time.tv_sec) + microseconds(time.tv_usec);
    timeval result{};
    result.tv_usec = static_cast<decltype(result.tv_usec)>(
        std::chrono::duration_cast<microseconds>(whole).count() * times / fasterAnswers);
    return result;
}

} // namespace

extern "C" {

int nanosleep(const timespec* duration, timespec* rest) {
    const Waiting now;
    const nanoseconds asked =
        std::chrono::seconds(duration->tv_sec) + nanoseconds(duration->tv_nsec);
    if (asked != grace) {
        return sleepFor(asked / faster, rest);
    }
    if (!isWithoutGrace.load(std::memory_order_relaxed)) {
        awaitDeadChild(asked);
    }
    return 0;
}

int select(int count, fd_set* readable, fd_set* writable, fd_set* exceptional, timeval* timeout) {
    static const auto original = nextFunction<decltype(select)>("select");
    const Waiting now;
    const int times = timesAsLong.load(std::memory_order_relaxed);
    timeval time = shortened(*timeout, times);
    const int result = original(count, readable, writable, exceptional, &time);
    if (result == 0) {
        timesAsLong.store(std::min(2 * times, mostTimesAsLong), std::memory_order_relaxed);
    }
    return result;
}

int setsockopt(int descriptor, int level, int name, const void* value, socklen_t length) noexcept {
    static const auto original = nextFunction<decltype(setsockopt)>("setsockopt");
    if (level != SOL_SOCKET || name != SO_SNDTIMEO) {
        return original(descriptor, level, name, value, length);
    }
    const timeval time = shortened(*static_cast<const timeval*>(value));
    return original(descriptor, level, name, &time, sizeof(time));
}

int pthread_create(pthread_t* thread, const pthread_attr_t* attributes, void* (*start)(void*),
                   void* argument) noexcept {
    if (threadsAllowed.load(std::memory_order_relaxed) != unlimited && threadsAllowed-- <= 0) {
        return EAGAIN;
    }
    return nextThreadCreation()(thread, attributes, start, argument);
}

} // extern "C"

int waitingThreads() {
    return waiting.load(std::memory_order_relaxed);
}

NoGracePeriod::NoGracePeriod() {
    isWithoutGrace = true;
}

NoGracePeriod::~NoGracePeriod() {
    isWithoutGrace = false;
}

ThreadLimit::ThreadLimit(int allowed) {
    threadsAllowed = allowed;
}

ThreadLimit::~ThreadLimit() {
    threadsAllowed = unlimited;
}

void passAMoment() {
    sleepFor(moment);
}
