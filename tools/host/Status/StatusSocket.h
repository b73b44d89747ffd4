/// @file
#pragma once

#include <functional>
#include <optional>
#include <string>

#include <sys/types.h>

#include "Events.h"
#include "Moment.h"
#include "Status/UnixSocket.h"

namespace vantelhost {

/// Where a run may be asked how it stands, unless it says otherwise.
constexpr char defaultStatusSocket[] = "/run/vantel-host/status.sock";

/// A Unix-domain stream socket (mode 0660) that gives each client one text and closes. Never waits:
/// what a client does not take at once is lost for it.
class StatusSocket {
public:
    using Clock = Moment::Clock;

    /// @param answer made for each client. Throws UsageError when the path is too long.
    StatusSocket(std::string path, std::function<std::string()> answer);

    /// Removes the socket, unless another one is in its place.
    ~StatusSocket();
    StatusSocket(const StatusSocket&) = delete;
    StatusSocket& operator=(const StatusSocket&) = delete;

    /// Serves who waits; listens first, unless it does already or has tried in the last 10 s. To be
    /// called again and again, by one thread.
    /// @return an event when it cannot listen, for another reason than before.
    std::optional<Event> attend(Clock::time_point now = Clock::now());

private:
    /// @return why it does not work; empty when it does.
    std::string listen();
    bool begin();
    void remove() const;
    void serve() const;

    const std::string path_;
    const std::function<std::string()> answer_;
    std::optional<UnixSocket> socket_; ///< while it listens
    dev_t device_ = 0;                 ///< of the socket's name, as the next
    ino_t inode_ = 0;
    Clock::time_point nextTry_ = Clock::time_point::min();
    std::string problem_; ///< of the last try
};

} // namespace vantelhost
