/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace vantelhost {

/// One moment in two clocks: nanoseconds since their epochs.
struct CrossTime {
    std::uint64_t local = 0;       ///< of the clock
    std::uint64_t realtime = 0;    ///< of CLOCK_REALTIME
    std::uint64_t uncertainty = 0; ///< so far, either way, that may be from the moment
};

/// A clock that the local times of pairs may be of.
class LocalClock {
public:
    LocalClock() = default;
    virtual ~LocalClock() = default;
    LocalClock(const LocalClock&) = delete;
    LocalClock& operator=(const LocalClock&) = delete;

    /// As people and programs are told of it.
    virtual const std::string& name() const = 0;

    /// Nanoseconds since its epoch. From any thread.
    /// @return nothing when it cannot be read: errno says why.
    virtual std::optional<std::uint64_t> now() const = 0;

    /// Reads it and CLOCK_REALTIME at once. One thread at a time.
    /// @return as now().
    virtual std::optional<CrossTime> cross() = 0;
};

} // namespace vantelhost
