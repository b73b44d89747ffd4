/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include <sys/un.h>

#include "Events.h"

namespace vantelhost {

/// Hands time pairs to chronyd's reference clock SOCK. Never waits: a pair that chronyd does not
/// take is dropped and counted, the next one is tried again.
class ChronyClock {
public:
    /// @param path chronyd's socket, which need not be there yet. Throws UsageError when it is too
    ///             long, std::system_error when there is no socket to send from.
    explicit ChronyClock(std::string path);
    ~ChronyClock();
    ChronyClock(const ChronyClock&) = delete;
    ChronyClock& operator=(const ChronyClock&) = delete;

    /// @return an event when handing over begins to work or to fail.
    std::optional<Event> take(std::uint64_t reference, std::uint64_t local);

    /// Counts a pair that chronyd is not to get.
    void withhold() { ++counts_.withheld; }

    /// Whether there were pairs, and none was taken.
    bool tookNone() const { return counts_.sent == 0 && counts_.failed > 0; }

    const ChronyCounts& counts() const { return counts_; }

    /// How it stands.
    Event state() const;

private:
    int send(const std::string& datagram) const;

    const std::string path_;
    const sockaddr_un address_;
    int descriptor_ = -1;
    ChronyCounts counts_;
    int error_ = -1; ///< errno of the last pair; 0 after success, -1 before the first
};

} // namespace vantelhost
