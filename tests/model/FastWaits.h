/// @file
/// The library's waits, much shorter, so that a session takes milliseconds: functions of the
/// C library that stand in this program. Nothing here puts what threads do in an order, which would
/// hide races from ThreadSanitizer.
#pragma once

/// How many threads of the library are in a wait now.
int waitingThreads();

/// While there is one, the library does not sleep between its looks at a daemon that is to end: for
/// one that will not end by itself. At any other time such a sleep is over when a child is dead.
class NoGracePeriod {
public:
    NoGracePeriod();
    ~NoGracePeriod();
    NoGracePeriod(const NoGracePeriod&) = delete;
    NoGracePeriod& operator=(const NoGracePeriod&) = delete;
};

/// Lets the creation of threads fail while it lives.
class ThreadLimit {
public:
    /// @param allowed threads that can still be created.
    explicit ThreadLimit(int allowed);
    ~ThreadLimit();
    ThreadLimit(const ThreadLimit&) = delete;
    ThreadLimit& operator=(const ThreadLimit&) = delete;
};

/// Waits for a moment, of this program and not of the library.
void passAMoment();
