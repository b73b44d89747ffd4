#include "StopSignal.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <system_error>

#include <unistd.h>

namespace vantelhost {

namespace {

/// The time until the deadline, at most an hour.
timespec leftUntil(StopSignal::Clock::time_point deadline) {
    using std::chrono::nanoseconds;
    constexpr nanoseconds longest = std::chrono::hours(1);
    constexpr std::int64_t second = 1000000000;
    const auto left =
        std::clamp(std::chrono::duration_cast<nanoseconds>(deadline - StopSignal::Clock::now()),
                   nanoseconds(0), longest);
    timespec result{};
    result.tv_sec = static_cast<int>(left.count() / second);
    result.tv_nsec = static_cast<int>(left.count() % second);
    return result;
}

} // namespace

StopSignal::StopSignal() {
    sigemptyset(&stopping_);
    sigaddset(&stopping_, SIGINT);
    sigaddset(&stopping_, SIGTERM);
    sigset_t blocked = stopping_;
    sigaddset(&blocked, SIGPIPE);
    const int error = pthread_sigmask(SIG_BLOCK, &blocked, nullptr);
    if (error != 0) {
        throw std::system_error(error, std::system_category(), "blocking signals");
    }
}

std::optional<std::string> StopSignal::waitUntil(std::optional<Clock::time_point> deadline) const {
    for (;;) {
        int signal = -1;
        if (deadline) {
            const timespec left = leftUntil(*deadline);
            signal = sigtimedwait(&stopping_, nullptr, &left);
        } else {
            signal = sigwaitinfo(&stopping_, nullptr);
        }
        if (signal > 0) {
            return signal == SIGINT ? "SIGINT" : "SIGTERM";
        }
        if (deadline && Clock::now() >= *deadline) {
            return std::nullopt;
        }
        if (errno != EAGAIN && errno != EINTR) {
            throw std::system_error(errno, std::system_category(), "waiting for signals");
        }
    }
}

void StopSignal::request() {
    ::kill(::getpid(), SIGTERM);
}

} // namespace vantelhost
