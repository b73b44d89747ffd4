/// @file
/// Functions of the C library that stand in this program, between the plug-in and the system.
#pragma once

#include <chrono>
#include <functional>
#include <ostream>
#include <vector>

#include <sys/types.h>

struct SentSignal {
    pid_t to;
    int number;
    bool operator==(const SentSignal& other) const {
        return to == other.to && number == other.number;
    }
};

/// For readable failures.
void PrintTo(const SentSignal& sent, std::ostream* out);

/// Every kill(2) of this process so far, or since they were last forgotten.
std::vector<SentSignal> sentSignals();
void forgetSentSignals();

/// By how much the sleeps below a second of this thread have been longer than they should, in all:
/// a busy machine wakes up late.
std::chrono::nanoseconds overslept();

/// What a thread has asked for: how often so far, and the shortest and the longest so far, or since
/// they were last forgotten.
struct Sleeps {
    int count;
    std::chrono::nanoseconds shortest;
    std::chrono::nanoseconds longest;
};

/// The sleeps below a second of all threads but the first: the worker's, one before each poll, when
/// no thread of the test uses nanosleep.
Sleeps sleepsOfWorker();

/// The same of the sleeps of a second and more: the watchdog's, one before each look at the daemon.
Sleeps sleepsOfWatchdog();

/// Of both, the shortest and the longest.
void forgetSleeps();

/// Lets thread creation fail while this object lives.
class ThreadLimit {
public:
    /// @param allowed threads that can still be created.
    explicit ThreadLimit(int allowed);
    ~ThreadLimit();
    ThreadLimit(const ThreadLimit&) = delete;
    ThreadLimit& operator=(const ThreadLimit&) = delete;
};

/// Ends sleeps of a second and more while this object lives: the watchdog's, so that a test that is
/// over need not wait for it.
class ShortSleeps {
public:
    ShortSleeps();
    ~ShortSleeps();
    ShortSleeps(const ShortSleeps&) = delete;
    ShortSleeps& operator=(const ShortSleeps&) = delete;
};

/// While this object lives the worker's sleeps pass at once, and are told instead, by its thread.
/// Only while there is no worker may this object come and go.
class ToldSleeps {
public:
    explicit ToldSleeps(std::function<void(std::chrono::nanoseconds)> teller);
    ~ToldSleeps();
    ToldSleeps(const ToldSleeps&) = delete;
    ToldSleeps& operator=(const ToldSleeps&) = delete;
};

/// Lets sleeps of 125 ms begin no sooner than this object goes: the worker's before its first poll.
class HeldPolls {
public:
    HeldPolls();
    ~HeldPolls();
    HeldPolls(const HeldPolls&) = delete;
    HeldPolls& operator=(const HeldPolls&) = delete;
};
