/// @file
/// Which time pairs are measurements.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "PairKind.h"

namespace vantelhost {

struct PairCounts {
    std::size_t measured = 0;
    std::size_t of1970 = 0;
    std::size_t falseOffsets = 0;
    std::size_t distrusted = 0; ///< measured, but not to be believed: only hosts tell

    std::size_t all() const { return measured + of1970 + falseOffsets + distrusted; }

    /// Whether Syncs come and every offset is exactly 0: no delay is measured.
    bool onlyZeros() const { return measured + distrusted == 0 && falseOffsets > 0; }
};

/// What to say about so many pairs that all have this offset, in nanoseconds.
std::string noDelayText(std::int64_t offset, std::uint64_t count);

/// Tells the time pairs of a session that are measurements from those that are none. Wants to hear
/// all that the session reports, in its order. Knows nothing of threads.
///
/// - Of 1970 is a pair whose local time is the epoch offset. Where another party may have written
///   that, so is one without a grandmaster whose local time goes back.
/// - False are the first offsets after the start, and after a grandmaster has come, that equal the
///   last one before exactly (0 at the start), until the first one that does not. The epoch offset
///   does not count there: each is what ptp4l gave.
class PairFilter {
public:
    /// An epoch offset is in use from now on. Before the first one it is 0.
    void epochOffset(std::int64_t nanoseconds);

    /// @param quality "usable" or another one
    /// @return whether a grandmaster has come.
    bool quality(std::string_view quality, std::string_view reason);

    /// Judges a pair, and counts it.
    /// @param local  nanoseconds modulo 2^64
    /// @param offset local minus reference, nanoseconds
    PairKind pair(std::uint64_t local, std::int64_t offset);

    const PairCounts& counts() const { return counts_; }

private:
    bool isOf1970(std::uint64_t local) const;

    std::uint64_t epochOffset_ = 0;
    bool hasGrandmaster_ = true;     ///< as far as is known
    bool isMeasuring_ = false;       ///< an offset has changed since the grandmaster came
    std::uint64_t lastLocal_ = 0;    ///< of the last pair
    std::uint64_t masterOffset_ = 0; ///< of the last pair, as ptp4l gave it
    PairCounts counts_;
};

} // namespace vantelhost
