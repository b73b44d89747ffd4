/// @file
#pragma once

#include <cstddef>

#include "Clock/LocalClock.h"

namespace vantelhost {

/// A PTP hardware clock, by its device, such as /dev/ptp0. It is only read.
///
/// The kernel reads it at once with CLOCK_REALTIME in one of three ways, the best first:
/// PTP_SYS_OFFSET_PRECISE, both latched by the hardware; PTP_SYS_OFFSET_EXTENDED, where the driver
/// reads the system's clock right before and after the moment; PTP_SYS_OFFSET, where the kernel
/// does so around the driver. Of the latter two the shortest of several readings counts. A way that
/// the clock does not have is not tried again.
class PtpClock : public LocalClock {
public:
    /// Throws std::system_error when the device cannot be opened, or is no clock that can be read.
    explicit PtpClock(const std::string& path);
    ~PtpClock() override;

    const std::string& name() const override { return path_; }
    std::optional<std::uint64_t> now() const override;
    std::optional<CrossTime> cross() override;

private:
    const std::string path_;
    const int descriptor_;
    std::size_t way_ = 0; ///< the best one that it may have
};

} // namespace vantelhost
