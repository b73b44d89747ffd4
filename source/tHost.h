/// @file
#pragma once

#include <cstdint>

namespace zekelVantel {

/// The two qualities that the host is told.
enum class tQuality { usable, unusable };

/// The host's side of one session: the `zekel_*` functions with the session's context.
///
/// Each call gets a fresh status. A negative code that the host leaves in it is thrown as
/// zeerr::Exception, but not while another exception is unwinding.
class tHost {
public:
    /// @param context the session slot's address.
    explicit tHost(void** context) : context_(context) {}

    /// The host's present time in nanoseconds, on the time base of ptp4l's ingress time stamps.
    std::uint64_t getTime() const;

    /// Hands over one time pair, in nanoseconds.
    void adjustTime(std::uint64_t referenceTime, std::uint64_t localTime) const;

    void setQuality(tQuality quality, const char* reason) const;
    void updateMetaData(const char* metadataJson) const;

private:
    void** context_;
};

} // namespace zekelVantel
