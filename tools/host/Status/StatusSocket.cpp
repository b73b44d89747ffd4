#include "Status/StatusSocket.h"

#include <cerrno>
#include <utility>

#include <fmt/format.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Status/UnixSocket.h"
#include "Text.h"

namespace vantelhost {

namespace {

constexpr std::chrono::seconds tryTime(10);
constexpr int backlog = 16;

} // namespace

StatusSocket::StatusSocket(std::string path, std::function<std::string()> answer)
    : path_(std::move(path)), answer_(std::move(answer)) {
    unixAddress(path_);
}

StatusSocket::~StatusSocket() {
    if (descriptor_ >= 0) {
        ::unlink(path_.c_str());
        ::close(descriptor_);
    }
}

std::optional<Event> StatusSocket::attend(Clock::time_point now) {
    if (descriptor_ >= 0) {
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
    const UnixSocket probe;
    if (probe.connectTo(path_) == 0) {
        return "another run listens there";
    }
    // Left behind by a run that was killed: whoever listened there is gone.
    struct stat state {};
    if (::lstat(path_.c_str(), &state) == 0 && S_ISSOCK(state.st_mode)) {
        ::unlink(path_.c_str());
    }
    UnixSocket socket;
    // Nobody can connect before it listens: the mode is right by then.
    if (socket.bindTo(path_) != 0 || ::chmod(path_.c_str(), 0660) != 0 ||
        ::listen(socket.descriptor(), backlog) != 0) {
        return errorText(errno);
    }
    descriptor_ = socket.release();
    return {};
}

void StatusSocket::serve() const {
    for (int i = 0; i < backlog; ++i) {
        const int client = ::accept4(descriptor_, nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC);
        if (client < 0) {
            return;
        }
        const std::string text = answer_();
        // A client that has gone, or does not read, has nothing of it.
        [[maybe_unused]] const auto sent =
            ::send(client, text.data(), text.size(), MSG_NOSIGNAL | MSG_DONTWAIT);
        ::close(client);
    }
}

} // namespace vantelhost
