/// @file
#pragma once

#include <chrono>
#include <functional>
#include <vector>

#include <sys/types.h>

/// Waits until a condition holds, for what tells nobody when it changes: log, files, processes.
/// @return false after the deadline.
bool waitUntil(const std::function<bool()>& condition,
               std::chrono::milliseconds deadline = std::chrono::seconds(20));

/// Whether this process has a child, running or dead and not waited for.
bool hasChildren();

/// Whether this process has a child that is dead and not waited for.
bool hasDeadChild();

/// The children of this process, running or dead and not waited for.
std::vector<pid_t> children();

/// Kills and reaps every child of this process.
void endChildren();

/// How many threads this process has.
int threadCount();

/// The same, after what a sanitizer starts beside the first thread has been started.
int settledThreadCount();

/// How many threads this process has, settled. When it goes it waits until there are no more: the
/// system lists a thread for a moment after it was joined, an emulator for longer.
class FormerThreads {
public:
    FormerThreads();
    ~FormerThreads();
    FormerThreads(const FormerThreads&) = delete;
    FormerThreads& operator=(const FormerThreads&) = delete;

    int count() const { return count_; }

private:
    int count_;
};
