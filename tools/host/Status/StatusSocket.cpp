#include "Status/StatusSocket.h"

#include <cerrno>
#include <utility>

#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Text.h"

namespace vantelhost {

namespace {

constexpr std::chrono::seconds tryTime(10);
constexpr int backlog = 16;

/// Why the name may not be taken over; empty when nobody listens there.
std::string reasonNotToListen(const std::string& path) {
    const UnixSocket probe;
    if (probe.connectTo(path) == 0 || errno == EAGAIN) {
        return "another run listens there";
    }
    return errno == ECONNREFUSED || errno == ENOENT ? "" : errorText(errno);
}

} // namespace

StatusSocket::StatusSocket(std::string path, std::function<std::string()> answer)
    : path_(std::move(path)), answer_(std::move(answer)) {
    unixAddress(path_);
}

StatusSocket::~StatusSocket() {
    if (socket_) {
        remove();
    }
}

std::optional<Event> StatusSocket::attend(Clock::time_point now) {
    if (socket_) {
        serve();
        return std::nullopt;
    }
    if (now < nextTry_) {
        return std::nullopt;
    }
    nextTry_ = now + tryTime;
    const std::string last = std::exchange(problem_, listen());
    if (problem_.empty() || problem_ == last) {
        return std::nullopt;
    }
    return statusSocketEvent(path_, problem_);
}

std::string StatusSocket::listen() {
    if (auto problem = reasonNotToListen(path_); !problem.empty()) {
        return problem;
    }
    // Left behind by a run that was killed: whoever listened there is gone.
    struct stat state {};
    if (::lstat(path_.c_str(), &state) == 0 && S_ISSOCK(state.st_mode)) {
        ::unlink(path_.c_str());
    }
    socket_.emplace();
    if (begin()) {
        return {};
    }
    const int error = errno;
    socket_.reset();
    return errorText(error);
}

/// @return whether it listens; else errno says why not, and the name is free again.
bool StatusSocket::begin() {
    struct stat state {};
    if (socket_->bindTo(path_) != 0 || ::lstat(path_.c_str(), &state) != 0) {
        return false;
    }
    device_ = state.st_dev;
    inode_ = state.st_ino;
    // Nobody can connect before it listens: the mode is right by then.
    if (::chmod(path_.c_str(), 0660) == 0 && ::listen(socket_->descriptor(), backlog) == 0) {
        return true;
    }
    const int error = errno;
    remove();
    errno = error;
    return false;
}

void StatusSocket::remove() const {
    struct stat state {};
    if (::lstat(path_.c_str(), &state) == 0 && state.st_dev == device_ && state.st_ino == inode_) {
        ::unlink(path_.c_str());
    }
}

void StatusSocket::serve() const {
    for (int i = 0; i < backlog; ++i) {
        const int descriptor =
            ::accept4(socket_->descriptor(), nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC);
        if (descriptor < 0) {
            return;
        }
        const UnixSocket client(descriptor);
        const std::string text = answer_();
        // A client that has gone, or does not read, has nothing of it.
        [[maybe_unused]] const auto sent =
            ::send(descriptor, text.data(), text.size(), MSG_NOSIGNAL | MSG_DONTWAIT);
    }
}

} // namespace vantelhost
