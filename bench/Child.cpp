#include "Child.h"

#include <array>
#include <csignal>
#include <ctime>
#include <stdexcept>

#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Clocks.h"

namespace {

double seconds(const timeval& time) {
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) * 1e-6;
}

} // namespace

Child::Child(const std::vector<std::string>& command) {
    std::vector<char*> arguments;
    for (const std::string& argument : command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    std::array<int, 2> in{};
    std::array<int, 2> out{};
    if (pipe2(in.data(), O_CLOEXEC) != 0 || pipe2(out.data(), O_CLOEXEC) != 0) {
        throw std::runtime_error("no pipe");
    }
    pid_ = fork();
    if (pid_ == 0) {
        prctl(PR_SET_PDEATHSIG, SIGKILL);
        dup2(in[0], STDIN_FILENO);
        dup2(out[1], STDOUT_FILENO);
        execv(arguments[0], arguments.data());
        _exit(127);
    }
    close(in[0]);
    close(out[1]);
    input_ = in[1];
    output_ = out[0];
    if (pid_ < 0) {
        throw std::runtime_error("no child");
    }
}

Child::~Child() {
    close(input_);
    close(output_);
    if (pid_ > 0) {
        kill(pid_, SIGTERM);
        waitpid(pid_, nullptr, 0);
    }
}

void Child::write(const std::string& input) const {
    if (::write(input_, input.data(), input.size()) != static_cast<ssize_t>(input.size())) {
        throw std::runtime_error("the child does not listen");
    }
}

std::string Child::read() const {
    pollfd descriptor{output_, POLLIN, 0};
    if (::poll(&descriptor, 1, 60000) != 1) {
        throw std::runtime_error("the child is silent");
    }
    std::array<char, 65536> buffer;
    const ssize_t count = ::read(output_, buffer.data(), buffer.size());
    return {buffer.data(), static_cast<std::size_t>(count > 0 ? count : 0)};
}

double Child::cpuSeconds() const {
    clockid_t clock = 0;
    clock_getcpuclockid(pid_, &clock);
    return secondsOf(clock);
}

double Child::waitForEnd() {
    rusage usage{};
    if (wait4(pid_, nullptr, 0, &usage) != pid_) {
        throw std::runtime_error("the child is gone");
    }
    pid_ = -1;
    return seconds(usage.ru_utime) + seconds(usage.ru_stime);
}
