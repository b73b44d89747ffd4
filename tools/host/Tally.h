/// @file
/// What a run is summed up with.
#pragma once

#include <cstdint>
#include <string>

#include "PairKind.h"

namespace vantelhost {

/// Statistics of offsets in nanoseconds.
struct OffsetStatistics {
    std::uint64_t count = 0;
    std::int64_t smallest = 0;
    std::int64_t largest = 0;
    long double sum = 0;
    long double squares = 0;

    void add(std::int64_t offset);

    /// Both are 0 when there are no offsets.
    double mean() const;
    double rms() const;
};

/// What is to be said of offsets that are all exactly the same, as only those of a clock that
/// measures no delay are: 0, or the epoch offset. Empty when they differ, or are so few that it may
/// only have begun.
std::string frozenOffsets(const OffsetStatistics& offsets);

struct Tally {
    OffsetStatistics offsets;          ///< one for each time pair
    LeftOutCounts leftOut;             ///< of those
    std::uint64_t qualityChanges = 0;  ///< quality calls whose values or reason are new
    std::uint64_t metadataUpdates = 0; ///< valid ones
    std::uint64_t timeRequests = 0;
    std::uint64_t refused = 0; ///< calls refused because the host is stopping
    std::uint64_t errors = 0;
    bool wasUsable = false; ///< the quality, at any time
    bool hasPorts = false;  ///< the last metadata: those after a failed poll have none
};

} // namespace vantelhost
