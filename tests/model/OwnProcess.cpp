#include "OwnProcess.h"

#include <stdexcept>

#include <fcntl.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include "support/Processes.h"
#include "support/TemporaryFolder.h"

#ifdef __SANITIZE_ADDRESS__
#include <sanitizer/lsan_interface.h>
#endif

namespace {

constexpr unsigned longest = 120; // s

int leaks() {
#ifdef __SANITIZE_ADDRESS__
    return __lsan_do_recoverable_leak_check();
#else
    return 0;
#endif
}

[[noreturn]] void beChild(const std::function<void()>& deed, const std::string& log) noexcept {
    const int descriptor = open(log.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    dup2(descriptor, STDERR_FILENO);
    close(descriptor);
    // Ends a child that hangs, and not those that it starts.
    alarm(longest);
    deed();
    _exit(leaks());
}

std::string nameOf(int status) {
    if (WIFEXITED(status)) {
        return WEXITSTATUS(status) == 0 ? "" : "status " + std::to_string(WEXITSTATUS(status));
    }
    return WTERMSIG(status) == SIGALRM ? "hung" : "signal " + std::to_string(WTERMSIG(status));
}

} // namespace

std::string failureInOwnProcess(const std::function<void()>& deed) {
    const TemporaryFolder folder;
    const std::string log = folder.path("stderr");
    // What a child leaves behind is then this process's.
    prctl(PR_SET_CHILD_SUBREAPER, 1);
    const pid_t child = fork();
    if (child == 0) {
        beChild(deed, log);
    }
    int status = -1;
    if (child < 0 || waitpid(child, &status, 0) != child) {
        throw std::runtime_error("no process");
    }
    endChildren();
    const std::string name = nameOf(status);
    return name.empty() ? "" : name + ": " + readFile(log);
}
