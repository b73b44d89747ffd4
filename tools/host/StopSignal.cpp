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

bool isIgnored(int number) {
    struct sigaction action {};
    ::sigaction(number, nullptr, &action);
    return action.sa_handler == SIG_IGN;
}

/// The name of a signal that ends the run; nothing for one that does not.
std::optional<std::string> nameOf(int number) {
    switch (number) {
    case SIGINT:
        return "SIGINT";
    case SIGTERM:
        return "SIGTERM";
    case SIGHUP:
        return "SIGHUP";
    case SIGQUIT:
        return "SIGQUIT";
    default:
        return std::nullopt;
    }
}

} // namespace

StopSignal::StopSignal() {
    sigemptyset(&awaited_);
    sigaddset(&awaited_, SIGINT);
    sigaddset(&awaited_, SIGTERM);
    sigaddset(&awaited_, SIGWINCH);
    for (const int number : {SIGHUP, SIGQUIT}) {
        if (!isIgnored(number)) {
            sigaddset(&awaited_, number);
        }
    }
    sigset_t blocked = awaited_;
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
            signal = sigtimedwait(&awaited_, nullptr, &left);
        } else {
            signal = sigwaitinfo(&awaited_, nullptr);
        }
        if (signal > 0) {
            return nameOf(signal);
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
