#include "support/Child.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

void require(bool succeeded, const std::string& what) {
    if (!succeeded) {
        throw std::system_error(errno, std::generic_category(), what);
    }
}

struct Pipe {
    Pipe() {
        std::array<int, 2> ends{};
        require(pipe2(ends.data(), O_CLOEXEC) == 0, "pipe2");
        reading = Descriptor(ends[0]);
        writing = Descriptor(ends[1]);
    }
    Descriptor reading;
    Descriptor writing;
};

/// Closes the descriptor at the end of the data.
void append(Descriptor& descriptor, std::string& text) {
    std::array<char, 4096> buffer{};
    const ssize_t count = read(descriptor.get(), buffer.data(), buffer.size());
    if (count > 0) {
        text.append(buffer.data(), static_cast<std::size_t>(count));
    } else {
        descriptor.close();
    }
}

int millisecondsUntil(std::chrono::steady_clock::time_point end) {
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(
        end - std::chrono::steady_clock::now());
    return static_cast<int>(std::max(left.count(), std::chrono::milliseconds::rep(0)));
}

double seconds(const timeval& time) {
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) * 1e-6;
}

} // namespace

Child::Child(const Words& command, const Words& environment) {
    Pipe input;
    Pipe output;
    Pipe errors;
    start(command, environment,
          {std::move(input.writing), std::move(output.reading), std::move(errors.reading)}, [&] {
              dup2(input.reading.get(), STDIN_FILENO);
              dup2(output.writing.get(), STDOUT_FILENO);
              dup2(errors.writing.get(), STDERR_FILENO);
          });
}

Child::~Child() {
    if (pid_ > 0) {
        kill(pid_, SIGKILL);
        waitpid(pid_, nullptr, 0);
    }
}

void Child::start(const Words& command, const Words& environment, Streams streams,
                  const std::function<void()>& connect) {
    streams_ = std::move(streams);
    Words words = environment;
    if (!words.empty()) {
        words.insert(words.begin(), "/usr/bin/env");
    }
    words.insert(words.end(), command.begin(), command.end());
    std::vector<char*> arguments;
    for (std::string& word : words) {
        arguments.push_back(word.data());
    }
    arguments.push_back(nullptr);
    const pid_t parent = getpid();
    pid_ = fork();
    if (pid_ == 0) {
        prctl(PR_SET_PDEATHSIG, SIGKILL);
        if (getppid() == parent) {
            connect();
            execv(arguments[0], arguments.data());
        }
        _exit(127);
    }
    require(pid_ > 0, "fork");
    process_ = Descriptor(static_cast<int>(syscall(SYS_pidfd_open, pid_, 0)));
    require(process_.isOpen(), "pidfd_open");
}

bool Child::isRunning() const {
    pollfd process{process_.get(), POLLIN, 0};
    return process_.isOpen() && poll(&process, 1, 0) == 0;
}

void Child::signal(int number) const {
    if (pid_ > 0) {
        kill(pid_, number);
    }
}

double Child::cpuSeconds() const {
    if (pid_ < 0) {
        return cpuSeconds_;
    }
    clockid_t clock = 0;
    timespec time{};
    clock_getcpuclockid(pid_, &clock);
    clock_gettime(clock, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

void Child::write(const std::string& text) const {
    require(::write(streams_.input.get(), text.data(), text.size()) ==
                static_cast<ssize_t>(text.size()),
            "writing to a child");
}

bool Child::waitForOutput(const std::string& text, int count) {
    const auto end = Clock::now() + std::chrono::seconds(20);
    std::size_t start = 0;
    while (count > 0) {
        const std::size_t found = outputText_.find(text, start);
        if (found != std::string::npos) {
            start = found + text.size();
            --count;
        } else if (!streams_.output.isOpen() || !read(end)) {
            return false;
        }
    }
    return true;
}

int Child::wait(std::chrono::seconds patience) {
    const auto end = Clock::now() + patience;
    streams_.input.close();
    while (read(end)) {
    }
    pollfd process{process_.get(), POLLIN, 0};
    if (poll(&process, 1, millisecondsUntil(end)) != 1) {
        return -1;
    }
    int status = 0;
    rusage usage{};
    wait4(pid_, &status, 0, &usage);
    pid_ = -1;
    process_.close();
    cpuSeconds_ = seconds(usage.ru_utime) + seconds(usage.ru_stime);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 1000 + WTERMSIG(status);
}

/// @return false when both outputs are at their end, or nothing has come in time.
bool Child::read(Clock::time_point end) {
    pollfd streams[] = {{streams_.output.get(), POLLIN, 0}, {streams_.errors.get(), POLLIN, 0}};
    if ((!streams_.output.isOpen() && !streams_.errors.isOpen()) ||
        poll(streams, 2, millisecondsUntil(end)) <= 0) {
        return false;
    }
    if (streams[0].revents != 0) {
        append(streams_.output, outputText_);
    }
    if (streams[1].revents != 0) {
        append(streams_.errors, errorsText_);
    }
    return true;
}
