#include "Checks/TimedProgram.h"

#include <array>
#include <cerrno>
#include <csignal>

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

namespace vantelhost {

namespace {

using Clock = std::chrono::steady_clock;

/// The end of a pipe from which a program's outputs come.
class Output {
public:
    Output() {
        int ends[2];
        if (::pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0) {
            error_ = errno;
            return;
        }
        reading_ = ends[0];
        writing_ = ends[1];
    }
    ~Output() {
        closeWriting();
        close(reading_);
    }
    Output(const Output&) = delete;
    Output& operator=(const Output&) = delete;

    int error() const { return error_; }
    int writing() const { return writing_; }
    void closeWriting() { close(writing_); }

    void wait(int milliseconds) const {
        pollfd descriptor{reading_, POLLIN, 0};
        ::poll(&descriptor, 1, milliseconds);
    }

    /// What has come so far.
    void drainTo(std::string& text) {
        constexpr std::size_t most = 65536;
        std::array<char, 4096> buffer{};
        for (;;) {
            const ssize_t count = ::read(reading_, buffer.data(), buffer.size());
            if (count > 0 && text.size() < most) {
                text.append(buffer.data(), static_cast<std::size_t>(count));
            } else if (count == 0) {
                close(reading_);
            }
            if (count <= 0 || text.size() >= most) {
                return;
            }
        }
    }

private:
    static void close(int& descriptor) {
        if (descriptor >= 0) {
            ::close(descriptor);
            descriptor = -1;
        }
    }

    int error_ = 0;
    int reading_ = -1;
    int writing_ = -1;
};

/// In a process group of its own.
/// @return 0, or errno.
int spawn(const std::vector<std::string>& command, int output, pid_t& pid) {
    std::vector<char*> arguments;
    arguments.reserve(command.size() + 1);
    for (const auto& word : command) {
        arguments.push_back(const_cast<char*>(word.c_str()));
    }
    arguments.push_back(nullptr);
    char* const environment[] = {nullptr};
    posix_spawn_file_actions_t actions;
    posix_spawnattr_t attributes;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawnattr_init(&attributes);
    ::posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    ::posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, output, STDERR_FILENO);
    ::posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETPGROUP);
    const int error = ::posix_spawn(&pid, arguments[0], &actions, &attributes, arguments.data(),
                                    static_cast<char* const*>(environment));
    ::posix_spawnattr_destroy(&attributes);
    ::posix_spawn_file_actions_destroy(&actions);
    return error;
}

} // namespace

ProgramEnd runTimed(const std::vector<std::string>& command, std::chrono::milliseconds longest) {
    constexpr int pollTime = 10; // ms
    ProgramEnd end;
    Output output;
    pid_t pid = -1;
    end.error = output.error() != 0 ? output.error() : spawn(command, output.writing(), pid);
    if (end.error != 0) {
        return end;
    }
    output.closeWriting();
    const auto deadline = Clock::now() + longest;
    // Not 0 also where the end of children is not told: it has ended then, too.
    while (::waitpid(pid, &end.status, WNOHANG) == 0) {
        if (Clock::now() >= deadline) {
            end.timedOut = true;
            ::kill(-pid, SIGKILL);
            ::waitpid(pid, nullptr, 0);
            break;
        }
        output.wait(pollTime);
        output.drainTo(end.output);
    }
    output.drainTo(end.output);
    return end;
}

} // namespace vantelhost
