#include "tPtp4lProcess.h"

#include <chrono>
#include <csignal>
#include <thread>

#include <sys/wait.h>
#include <syslog.h>
#include <unistd.h>

#include "errors/ErrnoText.h"
#include "errors/Exception.h"

namespace zekelVantel {
namespace {

constexpr int terminationPolls = 1000;
constexpr std::chrono::milliseconds terminationPollInterval{10};

/// Holds all signals back while it lives: after vfork, a handler of the host would run in the
/// child, on the host's memory.
class tSignalBlock {
public:
    tSignalBlock() {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &previous_);
    }
    ~tSignalBlock() { pthread_sigmask(SIG_SETMASK, &previous_, nullptr); }
    tSignalBlock(const tSignalBlock&) = delete;
    tSignalBlock& operator=(const tSignalBlock&) = delete;

private:
    sigset_t previous_{};
};

/// Whether execve would reset it; until then, a handler would run on the host's memory.
bool isHandled(int signal) {
    struct sigaction action {};
    return sigaction(signal, nullptr, &action) == 0 && action.sa_handler != SIG_DFL &&
           action.sa_handler != SIG_IGN;
}

/// The child, on the memory of its parent: nothing here may return or allocate.
[[noreturn]] void becomePtp4l(char* const* arguments) {
    struct sigaction byDefault {};
    byDefault.sa_handler = SIG_DFL;
    for (int signal = 1; signal < NSIG; ++signal) {
        // A host may block or ignore SIGTERM; ptp4l must still be ended by it.
        if (signal == SIGTERM || signal == SIGCHLD || isHandled(signal)) {
            sigaction(signal, &byDefault, nullptr);
        }
    }
    sigset_t none;
    sigemptyset(&none);
    pthread_sigmask(SIG_SETMASK, &none, nullptr);
    // [oddity silent-exec] A failure is not logged here: the watchdog reports the death.
    _exit(execve(arguments[0], arguments, nullptr));
}

} // namespace

void tPtp4lProcess::spawn(const std::string& program, const std::string& configFile,
                          const std::vector<std::string>& interfaces) {
    std::vector<const char*> arguments = {program.c_str(), "-f", configFile.c_str()};
    for (const std::string& interface : interfaces) {
        arguments.insert(arguments.end(), {"-i", interface.c_str()});
    }
    arguments.push_back(nullptr);

    const tSignalBlock block;
    reaped_ = false;
    pid_ = vfork();
    if (pid_ == 0) {
        becomePtp4l(const_cast<char* const*>(arguments.data()));
    }
    if (pid_ < 0) {
        const zeerr::ErrnoText error;
        syslog(LOG_ERR, "Unable to fork subprocess in vantel, got errno: %s", error.text());
        zeerr::throwError(zeerr::site::forkFailed);
    }
}

bool tPtp4lProcess::hasDied() {
    if (!reaped_) {
        reaped_ = pid_ == -1 || waitpid(pid_, nullptr, WNOHANG) != 0;
    }
    return reaped_;
}

void tPtp4lProcess::terminate() {
    if (!hasDied()) {
        kill(pid_, SIGTERM);
    }
    for (int poll = 0; poll < terminationPolls && !hasDied(); ++poll) {
        std::this_thread::sleep_for(terminationPollInterval);
    }
    if (!hasDied()) {
        // [oddity sigkill-text] The "x" belongs to the text: those who watch the log search for it.
        syslog(LOG_ERR, "Killing ptp4l subprocess (pid %ld) using SIGKILL.x",
               static_cast<long>(pid_));
        // [oddity unreaped-kill] Not waited for: what SIGKILL cannot end at once must not hold the
        // host.
        kill(pid_, SIGKILL);
    }
    pid_ = -1;
}

} // namespace zekelVantel
