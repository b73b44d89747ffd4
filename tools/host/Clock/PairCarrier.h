/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "Clock/Carried.h"
#include "Clock/LocalClock.h"
#include "Events.h"

namespace vantelhost {

/// Carries the local times of pairs over to CLOCK_REALTIME, by a cross time stamp at each pair. One
/// thread at a time.
///
/// Between two cross time stamps, 2 s apart at most, time is taken to run straight: neither the
/// pair's age nor the clocks' difference in rate then matters. Where there are no two, the clocks
/// are taken to run alike, and 100 ppm of the age is uncertain.
///
/// A local time that is more than 2 s from the clock's is of another one, and refused.
class PairCarrier {
public:
    /// @return a sentence about a local time that is not of the clock.
    using Namer = std::function<std::string(std::uint64_t local, const std::string& clock)>;

    struct Result {
        std::optional<Carried> time; ///< nothing when the pair is refused
        std::optional<Event> news;   ///< an error when refusing begins, a note when it has ended
    };

    explicit PairCarrier(Namer namer) : namer_(std::move(namer)) {}

    /// The times to come are another session's, or another clock's.
    void begin();

    /// The plug-in adds this to the local times from now on; before the first one 0. The one before
    /// is still tried, as it may not have read the new one yet.
    void epochOffset(std::int64_t nanoseconds);

    /// @param local nanoseconds modulo 2^64, with the epoch offset
    Result carry(LocalClock& clock, std::uint64_t local);

    /// Pairs since the refusal began that goes on; 0 when there is none.
    std::uint64_t refused() const { return refused_; }

private:
    Result refuse(const std::string& problem);

    /// The local time without the epoch offset, if it is of the clock.
    std::optional<std::uint64_t> ingressOf(std::uint64_t local, std::uint64_t now) const;
    Carried carriedBy(const CrossTime& cross, std::uint64_t ingress);

    const Namer namer_;
    std::uint64_t epochOffset_ = 0;
    std::uint64_t epochOffsetBefore_ = 0;
    std::optional<CrossTime> last_;
    std::uint64_t refused_ = 0;
};

} // namespace vantelhost
