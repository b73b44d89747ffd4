#include "Child.h"

#include <array>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <stdexcept>

#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include "ProgramArguments.h"

namespace {

using Clock = std::chrono::steady_clock;
constexpr std::chrono::seconds patience(20);

struct Pipe {
    Pipe() {
        int ends[2];
        if (::pipe2(ends, O_CLOEXEC) != 0) {
            throw std::runtime_error("pipe2");
        }
        reading = ends[0];
        writing = ends[1];
    }
    int reading;
    int writing;
};

void closeIfOpen(int& descriptor) {
    if (descriptor >= 0) {
        ::close(descriptor);
        descriptor = -1;
    }
}

/// @return false at the end of the data; the descriptor is then closed.
bool append(int& descriptor, std::string& text) {
    std::array<char, 65536> buffer;
    const ssize_t count = ::read(descriptor, buffer.data(), buffer.size());
    if (count <= 0) {
        closeIfOpen(descriptor);
        return false;
    }
    text.append(buffer.data(), static_cast<std::size_t>(count));
    return true;
}

} // namespace

Child::Child(const std::vector<std::string>& command, const std::vector<std::string>& environment,
             const std::string& input) {
    const ProgramArguments arguments(command);
    const ProgramArguments variables(environmentWith(environment));
    Pipe in;
    Pipe out;
    Pipe err;
    const pid_t parent = ::getpid();
    pid_ = ::fork();
    if (pid_ == 0) {
        ::prctl(PR_SET_PDEATHSIG, SIGKILL);
        if (::getppid() != parent) {
            ::_exit(126);
        }
        ::dup2(in.reading, STDIN_FILENO);
        ::dup2(out.writing, STDOUT_FILENO);
        ::dup2(err.writing, STDERR_FILENO);
        ::execve(command[0].c_str(), arguments.get(), variables.get());
        ::_exit(127);
    }
    outputDescriptor_ = out.reading;
    errorsDescriptor_ = err.reading;
    ::close(in.reading);
    ::close(out.writing);
    ::close(err.writing);
    // A few octets: they fit into the pipe.
    const auto written = ::write(in.writing, input.data(), input.size());
    ::close(in.writing);
    if (pid_ < 0 || written != static_cast<ssize_t>(input.size())) {
        throw std::runtime_error("starting " + command[0]);
    }
}

Child::~Child() {
    if (pid_ > 0) {
        ::kill(pid_, SIGKILL);
        ::waitpid(pid_, nullptr, 0);
    }
    closeIfOpen(outputDescriptor_);
    closeIfOpen(errorsDescriptor_);
}

void Child::signal(int number) const {
    ::kill(pid_, number);
}

bool Child::waitForOutput(const std::string& text) {
    const auto end = Clock::now() + patience;
    while (output_.find(text) == std::string::npos) {
        if (Clock::now() >= end || outputDescriptor_ < 0) {
            return false;
        }
        readSome(100);
    }
    return true;
}

void Child::closeOutput() {
    closeIfOpen(outputDescriptor_);
}

int Child::wait() {
    const auto end = Clock::now() + patience;
    while (readSome(100)) {
        if (Clock::now() >= end) {
            return -1;
        }
    }
    // Both outputs are at their end: the program is ending.
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

/// @return false when there is nothing left to read from.
bool Child::readSome(int milliseconds) {
    pollfd descriptors[] = {{outputDescriptor_, POLLIN, 0}, {errorsDescriptor_, POLLIN, 0}};
    if (::poll(descriptors, 2, milliseconds) > 0) {
        if (descriptors[0].revents != 0) {
            append(outputDescriptor_, output_);
        }
        if (descriptors[1].revents != 0) {
            append(errorsDescriptor_, errors_);
        }
    }
    return outputDescriptor_ >= 0 || errorsDescriptor_ >= 0;
}
