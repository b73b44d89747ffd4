/// @file
#pragma once

#include <cstdint>
#include <optional>

#include "Report/PhaseGrid.h"
#include "Report/Statistics.h"

namespace vantelhost {

/// The means of successive stretches of equal length. Where more than half of a stretch is missing,
/// it has none.
class Averages {
public:
    /// @param length in slots; above 0
    explicit Averages(std::int64_t length) : length_(length) {}

    /// Slots ascend.
    void add(const PhaseSample& sample);

    std::uint64_t count() const { return count_; }

    /// The lowest and the highest mean, nanoseconds; nothing if there is none.
    std::optional<Extent> extent() const { return extent_; }

private:
    void close();

    std::int64_t length_;
    std::int64_t first_ = 0; ///< slot of the stretch
    double sum_ = 0;         ///< of its samples, nanoseconds
    std::int64_t samples_ = 0;
    std::uint64_t count_ = 0;
    std::optional<Extent> extent_;
};

} // namespace vantelhost
