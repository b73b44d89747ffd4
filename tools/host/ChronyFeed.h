/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>

#include "ChronyClock.h"
#include "Events.h"
#include "OffsetLevel.h"
#include "TaiOffset.h"

namespace vantelhost {

/// Whose clock stamps the Syncs.
enum class StampedBy {
    systemClock, ///< CLOCK_REALTIME: ptp4l has put the reference on UTC itself
    ptpClock     ///< a network card's: the reference is on the grandmaster's timescale
};

/// Hands chronyd time pairs on UTC. Those that are not to be believed there, though the pair is a
/// good one, are withheld: it is not known what timescale the reference has, or system's clock and
/// TAI minus UTC do not fit together, as within a leap second that came to one of them only.
class ChronyFeed {
public:
    /// @param path chronyd's socket: see ChronyClock
    ChronyFeed(std::string path, TaiOffset taiOffset)
        : clock_(std::move(path)), taiOffset_(std::move(taiOffset)) {}

    /// @param reference,local nanoseconds modulo 2^64; local is that of CLOCK_REALTIME
    /// @return an event, if there is something to tell.
    std::optional<Event> take(std::uint64_t reference, std::uint64_t local, StampedBy stampedBy);

    const ChronyClock& clock() const { return clock_; }

private:
    std::optional<Event> takeOfPtpClock(std::uint64_t reference, std::uint64_t local);
    std::optional<Event> refuse(const std::string& problem);

    ChronyClock clock_;
    const TaiOffset taiOffset_;
    OffsetLevel level_; ///< of the system's clock; PairTrust knows that of the one that stamps
    bool isRefusing_ = false;
};

} // namespace vantelhost
