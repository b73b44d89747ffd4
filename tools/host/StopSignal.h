/// @file
#pragma once

#include <chrono>
#include <optional>
#include <string>

#include <csignal>

namespace vantelhost {

/// SIGINT, SIGTERM, SIGHUP and SIGQUIT as something to wait for; the last two not when they are
/// ignored, as under nohup. To be made before any thread.
///
/// The signals stay blocked in the whole process, also after the object's end: a second one must
/// not interrupt an orderly stop. SIGPIPE is blocked too, so that a reader that goes away cannot
/// end a host whose plug-in has a child process.
class StopSignal {
public:
    using Clock = std::chrono::steady_clock;

    /// Throws std::system_error.
    StopSignal();

    /// Waits for a signal until the deadline, for ever without one.
    /// @return the signal's name, or nothing when the deadline or a new size of the terminal
    ///         (SIGWINCH) came first.
    std::optional<std::string> waitUntil(std::optional<Clock::time_point> deadline) const;

    /// Makes a waiting thread see SIGTERM. From any thread.
    static void request();

private:
    sigset_t awaited_;
};

} // namespace vantelhost
