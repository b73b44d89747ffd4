/// @file
#pragma once

#include <cstdint>
#include <optional>

#include "Moment.h"

namespace vantelhost {

/// The one axis of time on which the lines of all files and runs stand. Within a run the monotonic
/// clock counts, which nobody sets; from a run to the next the host's clock.
class RecordAxis {
public:
    /// The first moment of a run.
    /// @param fromStart whether the run's start is recorded: then the axis begins there
    /// @return the seconds since the last moment in the host's clock: below 0 when it was set back,
    /// and the run then follows at once; 0 at first
    double begin(const Moment& moment, bool fromStart);

    /// A moment of the same run. Throws std::runtime_error when it cannot be one.
    /// @return by how many seconds the host's clock was set since the last one; 0 mostly
    double follow(const Moment& moment);

    /// Whether it may be one of the same run, by both clocks.
    bool mayFollow(const Moment& moment) const;

    /// Of the last moment, since the beginning.
    double seconds() const { return seconds_; }

    /// The axis' beginning in the host's clock as it is now: nanoseconds since 1970.
    std::uint64_t origin() const;

private:
    double elapsed(const Moment& moment) const;

    std::optional<Moment> last_;
    double base_ = 0; ///< where the run's start is
    double seconds_ = 0;
};

} // namespace vantelhost
