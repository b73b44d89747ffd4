/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "Moment.h"
#include "OffsetLevel.h"
#include "PairFilter.h"
#include "PairKind.h"

namespace vantelhost {

/// Judges which time pairs of a session a clock may follow. Wants to hear all that the session
/// reports, in its order. Knows nothing of threads.
///
/// Of the pairs that PairFilter takes for measurements it leaves out
/// - the first two after a grandmaster has come back: ptp4l was seen to measure them with a delay
///   of before, up to 250 ms off,
/// - the eighth and later ones in a row with exactly the same offset. Nanoseconds that are noise
/// are
///   not even three times the same; those of a card that counts in steps of 8 ns may be, for a
///   clock that is well steered, but hardly eight times,
/// - those that jump: see OffsetLevel. That the clock was stepped is also seen by its time against
///   the monotonic one.
class PairTrust {
public:
    /// An epoch offset is in use from now on. Before the first one it is 0.
    void epochOffset(std::int64_t nanoseconds);

    /// @param quality "usable" or another one
    void quality(std::string_view quality, std::string_view reason);

    /// @param local  nanoseconds modulo 2^64
    /// @param offset local minus reference, nanoseconds
    /// @param moment of the call
    /// @return any kind but "unhealthy".
    PairKind pair(std::uint64_t local, std::int64_t offset, const Moment& moment);

private:
    PairKind judge(std::uint64_t local, std::int64_t offset);
    bool isRepeated(std::int64_t offset);
    bool hasStepped(const Moment& moment);

    PairFilter filter_;
    OffsetLevel level_;
    std::uint64_t epochOffset_ = 0;
    unsigned returning_ = 0; ///< so many measurements more are left out after a return
    std::int64_t lastOffset_ = 0;
    std::uint64_t equals_ = 0; ///< so many measurements in a row have that
    std::optional<Moment> lastMoment_;
};

} // namespace vantelhost
