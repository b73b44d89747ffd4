/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

namespace vantelhost {

/// TAI minus UTC as the kernel has it, in seconds: 0 until somebody tells it, such as chronyd with
/// "leapsectz". Of its clocks, as a sandbox may forbid adjtimex.
std::int64_t kernelTaiOffset();

/// Tells what is to be taken from the references of time pairs to have them on UTC. The
/// grandmaster's timescale is in nothing that the plug-in tells; what its time is ahead of the
/// system's clock shows it, where that is right to some seconds.
class TaiOffset {
public:
    struct Answer {
        std::optional<std::int64_t> seconds; ///< 0 when the grandmaster keeps UTC
        std::string problem;                 ///< why they are not known
    };

    /// @param seconds TAI minus UTC, 0 for never anything; nothing: what the kernel has
    /// @param kernel  asked for each pair: it changes with a leap second
    explicit TaiOffset(std::optional<std::int64_t> seconds,
                       std::function<std::int64_t()> kernel = kernelTaiOffset);

    /// @param ahead the reference minus CLOCK_REALTIME at the same moment, nanoseconds
    Answer of(std::int64_t ahead) const;

private:
    Answer ofKernel(double ahead) const;

    const std::optional<std::int64_t> seconds_;
    const std::function<std::int64_t()> kernel_;
};

} // namespace vantelhost
