#include "ChronyClock.h"

#include <cerrno>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <sys/socket.h>
#include <unistd.h>

#include "SockSample.h"
#include "Status/UnixSocket.h"
#include "Text.h"

namespace vantelhost {

ChronyClock::ChronyClock(std::string path)
    : path_(std::move(path)),
      address_(unixAddress(path_)),
      descriptor_(::socket(AF_UNIX, SOCK_DGRAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0)) {
    if (descriptor_ < 0) {
        throw std::system_error(errno, std::system_category(), "a socket for chronyd");
    }
}

ChronyClock::~ChronyClock() {
    ::close(descriptor_);
}

std::optional<Event> ChronyClock::take(std::uint64_t reference, std::uint64_t local) {
    const int error = send(sockSample(reference, local));
    ++(error == 0 ? counts_.sent : counts_.failed);
    const bool isNews = error_ < 0 || (error == 0) != (error_ == 0);
    error_ = error;
    return isNews ? std::optional(state()) : std::nullopt;
}

Event ChronyClock::state() const {
    if (error_ < 0) {
        return chronyEvent(counts_, "there was none");
    }
    return chronyEvent(counts_, error_ == 0 ? "" : fmt::format("{}: {}", path_, errorText(error_)));
}

/// To the path each time: chronyd may come later, and makes a new socket when it is restarted.
/// @return 0 or an errno.
int ChronyClock::send(const std::string& datagram) const {
    const ssize_t sent = ::sendto(descriptor_, datagram.data(), datagram.size(), MSG_NOSIGNAL,
                                  reinterpret_cast<const sockaddr*>(&address_), sizeof(address_));
    return sent < 0 ? errno : 0;
}

} // namespace vantelhost
