#include "Terminal.h"

#include <array>
#include <chrono>
#include <csignal>
#include <stdexcept>

#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include "ProgramArguments.h"

namespace {

using Clock = std::chrono::steady_clock;
constexpr std::chrono::seconds patience(20);

int countOf(const std::string& text, const std::string& in) {
    int count = 0;
    for (auto at = in.find(text); at != std::string::npos; at = in.find(text, at + text.size())) {
        ++count;
    }
    return count;
}

} // namespace

Terminal::Terminal(const std::vector<std::string>& command,
                   const std::vector<std::string>& environment) {
    const ProgramArguments arguments(command);
    const ProgramArguments variables(environmentWith(environment));
    winsize size{};
    size.ws_row = 24;
    size.ws_col = 80;
    const pid_t parent = ::getpid();
    pid_ = ::forkpty(&descriptor_, nullptr, nullptr, &size);
    if (pid_ == 0) {
        ::prctl(PR_SET_PDEATHSIG, SIGKILL);
        if (::getppid() != parent) {
            ::_exit(126);
        }
        ::execve(command[0].c_str(), arguments.get(), variables.get());
        ::_exit(127);
    }
    if (pid_ < 0) {
        throw std::runtime_error("starting " + command[0]);
    }
}

Terminal::~Terminal() {
    if (pid_ > 0) {
        ::kill(pid_, SIGKILL);
        ::waitpid(pid_, nullptr, 0);
    }
    ::close(descriptor_);
}

void Terminal::type(const std::string& keys) const {
    if (::write(descriptor_, keys.data(), keys.size()) != static_cast<ssize_t>(keys.size())) {
        throw std::runtime_error("typing");
    }
}

void Terminal::resize(unsigned short rows, unsigned short columns) const {
    winsize size{};
    size.ws_row = rows;
    size.ws_col = columns;
    ::ioctl(descriptor_, TIOCSWINSZ, &size);
}

void Terminal::signal(int number) const {
    ::kill(pid_, number);
}

bool Terminal::waitFor(const std::string& text, int count) {
    const auto end = Clock::now() + patience;
    while (countOf(text, output_) < count) {
        if (Clock::now() >= end || !readSome()) {
            return false;
        }
    }
    return true;
}

int Terminal::wait() {
    const auto end = Clock::now() + patience;
    while (readSome()) {
        if (Clock::now() >= end) {
            return -1;
        }
    }
    // Nobody has the terminal open any more: the program is ending.
    int status = 0;
    while (::waitpid(pid_, &status, WNOHANG) == 0) {
        if (Clock::now() >= end) {
            return -1;
        }
        ::poll(nullptr, 0, 5);
    }
    pid_ = -1;
    return WIFEXITED(status) ? WEXITSTATUS(status) : 1000 + WTERMSIG(status);
}

/// @return false when nobody has the terminal open any more.
bool Terminal::readSome() {
    pollfd descriptor{descriptor_, POLLIN, 0};
    if (::poll(&descriptor, 1, 100) <= 0) {
        return true;
    }
    std::array<char, 65536> buffer;
    const ssize_t count = ::read(descriptor_, buffer.data(), buffer.size());
    if (count <= 0) {
        return false;
    }
    output_.append(buffer.data(), static_cast<std::size_t>(count));
    return true;
}
