/// @file
/// Events of a running session, for whoever watches it. Each is a static probe point of the
/// provider "vantel_bc" and a trace line of the level `levelEvent`; docs/tracing.md lists them.
/// Nothing is formatted or allocated while nobody watches.
#pragma once

#include <cstddef>
#include <cstdint>

#include "errors/Status.h"

namespace zekelVantel {

/// Level of the trace lines of events: below the default threshold.
inline constexpr std::uint32_t levelEvent = 0x100;

/// One exchange of the management node: tells of its start when it is made, and of its end, with
/// the code that the status then holds, when it goes.
class tExchangeProbe {
public:
    /// @param status outlives this object.
    tExchangeProbe(std::uint16_t managementId, std::uint16_t sequenceId,
                   const zeerr::Status& status);
    ~tExchangeProbe();
    tExchangeProbe(const tExchangeProbe&) = delete;
    tExchangeProbe& operator=(const tExchangeProbe&) = delete;

private:
    std::uint16_t managementId_;
    std::uint16_t sequenceId_;
    const zeerr::Status& status_;
};

/// The worker is about to sleep.
void probeSleep(std::uint32_t microseconds);

/// The epoch FIFO was drained.
/// @param octets read, 8 for each offset; 0 also when the FIFO cannot be read.
/// @param kept   the offset that counts from now on, in nanoseconds.
void probeOffsets(std::size_t octets, std::int64_t kept);

/// The host's function returned.
/// @param code that it left in the status.
void probeHostCall(const char* function, std::int32_t code);

} // namespace zekelVantel
