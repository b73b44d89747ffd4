/// @file
#pragma once

#include <cstdint>

/// The host's four functions, as little as can be: the time is the system's. One at a time.
class Host {
public:
    Host();
    virtual ~Host();
    Host(const Host&) = delete;
    Host& operator=(const Host&) = delete;

    /// Called by the worker once for each poll that succeeded.
    virtual void polled() {}

    /// Called by the worker once for each new measurement, with the times of the pair.
    virtual void paired(std::uint64_t /*referenceTime*/, std::uint64_t /*localTime*/) {}

    /// Nanoseconds of the system's clock.
    static std::uint64_t now();
};
