/// @file
#pragma once

#include <stdexcept>

namespace vantelhost {

/// What was asked for cannot be done: a bad option, setting, library or FIFO. The text is for the
/// user.
class UsageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// The exit statuses of the program.
constexpr int exitClean = 0;
constexpr int exitFailed = 1;
constexpr int exitUsage = 2;

} // namespace vantelhost
