/// @file
#pragma once

#include <mutex>
#include <optional>
#include <string>

#include <csignal>
#include <sys/types.h>

namespace vantelhost {

/// How a child process ended.
struct ChildEnd {
    pid_t pid;
    bool bySignal;
    int status; ///< its exit status, or the signal
};

/// What SIGHUP asks for.
enum class Hangup { stop, reread };

/// SIGINT, SIGTERM, SIGHUP and SIGQUIT as something to wait for; the last two not when they are
/// ignored, as under nohup. With them the end of children, which is told whoever waits for them,
/// and SIGWINCH. To be made before any thread.
///
/// The signals stay blocked in the whole process, also after the object's end: a second one must
/// not interrupt an orderly stop. SIGPIPE is blocked too, so that a reader that goes away cannot
/// end a host whose plug-in has a child process.
class Signals {
public:
    /// What a signal tells; nothing of all when the terminal has a new size.
    struct News {
        std::string stop;    ///< the name of a signal that ends the run
        bool reread = false; ///< SIGHUP, where it is no such signal
        std::optional<ChildEnd> childEnd;
    };

    /// Throws std::system_error.
    explicit Signals(Hangup hangup = Hangup::stop);
    ~Signals();
    Signals(const Signals&) = delete;
    Signals& operator=(const Signals&) = delete;

    /// Readable when there is something to take.
    int descriptor() const { return descriptor_; }

    /// The next news; a stop before the end of a child. Never waits. Throws std::system_error.
    std::optional<News> take();

    /// Whether a signal has come that ends the run, taken or not. From any thread.
    bool stopHasCome() const;

    /// Makes the process see SIGTERM. From any thread.
    static void requestStop();

private:
    Hangup hangup_;
    sigset_t stops_{};
    int descriptor_ = -1;
    mutable std::mutex mutex_; ///< a stop is always seen pending or taken
    bool taken_ = false;
};

} // namespace vantelhost
