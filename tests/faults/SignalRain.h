/// @file
/// Signals of a host that handles them without SA_RESTART, so that they interrupt what is under
/// way.
#pragma once

#include <atomic>
#include <functional>
#include <set>
#include <thread>
#include <vector>

#include <sys/types.h>

/// The threads of this process.
std::set<pid_t> threadIds();

/// Waits until a thread sleeps, and sends it one signal. @return false after the deadline.
bool interrupt(pid_t thread);

/// Sends signals to threads, about one each millisecond, while this object lives.
class SignalRain {
public:
    /// @param condition asked before each shower.
    explicit SignalRain(
        std::vector<pid_t> threads, std::function<bool()> condition = [] { return true; });
    ~SignalRain();
    SignalRain(const SignalRain&) = delete;
    SignalRain& operator=(const SignalRain&) = delete;

private:
    std::atomic<bool> done_{false};
    std::thread thread_;
};

/// How many signals of both kinds have been handled so far.
int handledSignals();
