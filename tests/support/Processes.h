/// @file
#pragma once

#include <chrono>
#include <functional>

/// Waits until a condition holds, for what tells nobody when it changes: log, files, processes.
/// @return false after the deadline.
bool waitUntil(const std::function<bool()>& condition,
               std::chrono::milliseconds deadline = std::chrono::seconds(20));

/// Whether this process has a child, running or dead and not waited for.
bool hasChildren();

/// Kills and reaps every child of this process.
void endChildren();

/// How many threads this process has.
int threadCount();

/// The same, after what a sanitizer starts beside the first thread has been started.
int settledThreadCount();
