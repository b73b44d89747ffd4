#include "Interposed.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <cstring>
#include <ctime>
#include <limits>
#include <mutex>

#include <dlfcn.h>
#include <pthread.h>
#include <sys/syscall.h>
#include <unistd.h>

#include "support/OwnAllocations.h"

// A sanitizer's, when there is one: it must know of every thread.
extern "C" [[gnu::weak]] int __interceptor_pthread_create(pthread_t* thread,
                                                          const pthread_attr_t* attributes,
                                                          void* (*start)(void*), void* argument);

namespace {

constexpr long beforeFirstPoll = 125000000;

thread_local std::chrono::nanoseconds oversleptByThisThread{0};

constexpr int unlimited = std::numeric_limits<int>::max();

std::atomic<int> threadsAllowed{unlimited};

struct Signals {
    std::mutex mutex;
    std::vector<SentSignal> sent;
};

Signals& signals() {
    static Signals instance;
    return instance;
}

struct Sleeps {
    std::mutex mutex;
    std::condition_variable changed;
    bool areShort = false;
    bool areHeld = false;
};

Sleeps& sleeps() {
    static Sleeps instance;
    return instance;
}

using CreateThread = int (*)(pthread_t*, const pthread_attr_t*, void* (*)(void*), void*);

CreateThread nextCreateThread() {
    if (__interceptor_pthread_create != nullptr) {
        return &__interceptor_pthread_create;
    }
    void* const address = dlsym(RTLD_NEXT, "pthread_create");
    CreateThread function = nullptr;
    std::memcpy(&function, &address, sizeof(function));
    return function;
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] int kill(pid_t pid, int number) noexcept {
    {
        const OwnAllocations own;
        const std::lock_guard<std::mutex> lock(signals().mutex);
        signals().sent.push_back({pid, number});
    }
    return static_cast<int>(syscall(SYS_kill, pid, number));
}

[[gnu::visibility("default")]] int nanosleep(const timespec* duration, timespec* rest) {
    if (duration->tv_sec == 0) {
        if (duration->tv_nsec == beforeFirstPoll) {
            std::unique_lock<std::mutex> lock(sleeps().mutex);
            sleeps().changed.wait(lock, [] { return !sleeps().areHeld; });
        }
        const auto end =
            std::chrono::steady_clock::now() + std::chrono::nanoseconds(duration->tv_nsec);
        const int result = static_cast<int>(syscall(SYS_nanosleep, duration, rest));
        oversleptByThisThread +=
            std::max(std::chrono::nanoseconds(0),
                     std::chrono::nanoseconds(std::chrono::steady_clock::now() - end));
        return result;
    }
    std::unique_lock<std::mutex> lock(sleeps().mutex);
    sleeps().changed.wait_for(
        lock, std::chrono::seconds(duration->tv_sec) + std::chrono::nanoseconds(duration->tv_nsec),
        [] { return sleeps().areShort; });
    return 0;
}

[[gnu::visibility("default")]] int pthread_create(pthread_t* thread,
                                                  const pthread_attr_t* attributes,
                                                  void* (*start)(void*), void* argument) noexcept {
    if (threadsAllowed != unlimited && threadsAllowed-- <= 0) {
        return EAGAIN;
    }
    return nextCreateThread()(thread, attributes, start, argument);
}

} // extern "C"

void PrintTo(const SentSignal& sent, std::ostream* out) {
    *out << "signal " << sent.number << " to " << sent.to;
}

std::vector<SentSignal> sentSignals() {
    const std::lock_guard<std::mutex> lock(signals().mutex);
    return signals().sent;
}

void forgetSentSignals() {
    const std::lock_guard<std::mutex> lock(signals().mutex);
    signals().sent.clear();
}

std::chrono::nanoseconds overslept() {
    return oversleptByThisThread;
}

ThreadLimit::ThreadLimit(int allowed) {
    threadsAllowed = allowed;
}

ThreadLimit::~ThreadLimit() {
    threadsAllowed = unlimited;
}

ShortSleeps::ShortSleeps() {
    const std::lock_guard<std::mutex> lock(sleeps().mutex);
    sleeps().areShort = true;
    sleeps().changed.notify_all();
}

ShortSleeps::~ShortSleeps() {
    const std::lock_guard<std::mutex> lock(sleeps().mutex);
    sleeps().areShort = false;
}

HeldPolls::HeldPolls() {
    const std::lock_guard<std::mutex> lock(sleeps().mutex);
    sleeps().areHeld = true;
}

HeldPolls::~HeldPolls() {
    const std::lock_guard<std::mutex> lock(sleeps().mutex);
    sleeps().areHeld = false;
    sleeps().changed.notify_all();
}
