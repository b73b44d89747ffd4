/// @file
/// Answers that wait for their time.
#pragma once

#include "Log.h"
#include "ManagementSocket.h"

#include <cstdint>
#include <list>
#include <optional>

namespace simptp4l {

/// Sends each answer at its time, and those of one time in the order of `add`. An answer that finds
/// the client's queue full is tried again for half a second, then dropped and logged; what follows
/// for that client waits behind it.
class Outbox {
public:
    void add(std::int64_t due, const Octets& octets, const Address& to);

    /// Sends what is due.
    void send(std::int64_t now, ManagementSocket& socket, Log& log);

    /// When to call `send` next; empty when nothing waits.
    std::optional<std::int64_t> next(std::int64_t now) const;

private:
    struct Entry {
        std::int64_t due;
        Octets octets;
        Address to;
    };

    /// @return false when the entry must be tried again.
    static bool attempt(const Entry& entry, std::int64_t now, ManagementSocket& socket, Log& log);

    std::list<Entry> entries_; ///< by due time
};

} // namespace simptp4l
