#include "Interposed.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <ctime>
#include <limits>
#include <mutex>
#include <utility>

#include <linux/futex.h>
#include <pthread.h>
#include <sys/syscall.h>
#include <unistd.h>

#include "support/NextThreadCreation.h"
#include "support/OwnAllocations.h"

namespace {

using std::chrono::nanoseconds;
using std::chrono::steady_clock;

constexpr std::chrono::milliseconds beforeFirstPoll{125};

thread_local nanoseconds oversleptByThisThread{0};

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

struct Hold {
    std::mutex mutex;
    std::condition_variable changed;
    bool isOn = false;
};

Hold& hold() {
    static Hold instance;
    return instance;
}

/// Whether sleeps of a second and more are short: a futex, so that what waits for it is interrupted
/// by signals as nanosleep is.
std::atomic<int> sleepsAreShort{0};
static_assert(sizeof(sleepsAreShort) == sizeof(int) && std::atomic<int>::is_always_lock_free);

struct SleepCounts {
    std::atomic<int> count{0};
    std::atomic<nanoseconds> shortest{nanoseconds::max()};
    std::atomic<nanoseconds> longest{nanoseconds::min()};

    void add(nanoseconds duration) {
        shortest = std::min(shortest.load(), duration);
        longest = std::max(longest.load(), duration);
        ++count;
    }
    void forget() {
        shortest = nanoseconds::max();
        longest = nanoseconds::min();
    }
    Sleeps soFar() const { return {count, shortest, longest}; }
};

SleepCounts countsOfWorker;
SleepCounts countsOfWatchdog;

/// Empty: they are slept.
std::function<void(nanoseconds)>& sleepTeller() {
    static std::function<void(nanoseconds)> instance;
    return instance;
}

/// The worker alone sleeps less than a second without being the first thread.
bool isWorkers(nanoseconds duration) {
    return duration < std::chrono::seconds(1) && gettid() != getpid();
}

void countSleep(nanoseconds duration) {
    if (isWorkers(duration)) {
        countsOfWorker.add(duration);
    } else if (gettid() != getpid()) {
        countsOfWatchdog.add(duration);
    }
}

timespec toTimespec(nanoseconds duration) {
    const auto whole = std::chrono::duration_cast<std::chrono::seconds>(duration);
    timespec result{};
    result.tv_sec = static_cast<decltype(result.tv_sec)>(whole.count());
    result.tv_nsec = static_cast<decltype(result.tv_nsec)>((duration - whole).count());
    return result;
}

/// As nanosleep, but over at once when sleeps are short, or get short.
int sleepLong(const timespec* duration, nanoseconds end, timespec* rest) {
    syscall(SYS_futex, &sleepsAreShort, FUTEX_WAIT_PRIVATE, 0, duration, nullptr, 0);
    const nanoseconds left = end - steady_clock::now().time_since_epoch();
    if (sleepsAreShort != 0 || left <= nanoseconds(0)) {
        return 0;
    }
    if (rest != nullptr) {
        *rest = toTimespec(left);
    }
    errno = EINTR;
    return -1;
}

int sleepBriefly(const timespec* duration, nanoseconds end, timespec* rest) {
    const int result = static_cast<int>(syscall(SYS_nanosleep, duration, rest));
    oversleptByThisThread += std::max(nanoseconds(0), steady_clock::now().time_since_epoch() - end);
    return result;
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
    const auto asked = std::chrono::seconds(duration->tv_sec) + nanoseconds(duration->tv_nsec);
    countSleep(asked);
    if (asked == beforeFirstPoll) {
        std::unique_lock<std::mutex> lock(hold().mutex);
        hold().changed.wait(lock, [] { return !hold().isOn; });
    }
    if (isWorkers(asked) && sleepTeller()) {
        sleepTeller()(asked);
        return 0;
    }
    const nanoseconds end = steady_clock::now().time_since_epoch() + asked;
    return asked < std::chrono::seconds(1) ? sleepBriefly(duration, end, rest)
                                           : sleepLong(duration, end, rest);
}

[[gnu::visibility("default")]] int pthread_create(pthread_t* thread,
                                                  const pthread_attr_t* attributes,
                                                  void* (*start)(void*), void* argument) noexcept {
    if (threadsAllowed != unlimited && threadsAllowed-- <= 0) {
        return EAGAIN;
    }
    return nextThreadCreation()(thread, attributes, start, argument);
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

nanoseconds overslept() {
    return oversleptByThisThread;
}

Sleeps sleepsOfWorker() {
    return countsOfWorker.soFar();
}

Sleeps sleepsOfWatchdog() {
    return countsOfWatchdog.soFar();
}

void forgetSleeps() {
    countsOfWorker.forget();
    countsOfWatchdog.forget();
}

ThreadLimit::ThreadLimit(int allowed) {
    threadsAllowed = allowed;
}

ThreadLimit::~ThreadLimit() {
    threadsAllowed = unlimited;
}

ShortSleeps::ShortSleeps() {
    sleepsAreShort = 1;
    syscall(SYS_futex, &sleepsAreShort, FUTEX_WAKE_PRIVATE, std::numeric_limits<int>::max());
}

ShortSleeps::~ShortSleeps() {
    sleepsAreShort = 0;
}

ToldSleeps::ToldSleeps(std::function<void(nanoseconds)> teller) {
    sleepTeller() = std::move(teller);
}

ToldSleeps::~ToldSleeps() {
    sleepTeller() = nullptr;
}

HeldPolls::HeldPolls() {
    const std::lock_guard<std::mutex> lock(hold().mutex);
    hold().isOn = true;
}

HeldPolls::~HeldPolls() {
    const std::lock_guard<std::mutex> lock(hold().mutex);
    hold().isOn = false;
    hold().changed.notify_all();
}
