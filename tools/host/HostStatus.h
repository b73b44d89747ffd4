/// @file
/// The error statuses of both directions, as this host handles them.
#pragma once

#include <cstdint>
#include <string>

#include <vantel_bc/status.h>

namespace vantelhost {

/// The code with which this host answers a call that breaks the interface's rules.
constexpr std::int32_t invalidParameter = -52005;

/// The code with which this host answers a call for which it has no memory.
constexpr std::int32_t memoryFull = -52000;

/// A status that this host lends to the plug-in for one call. Its text lives in this host's memory
/// and is released with the object. Belongs to one thread at a time.
class HostStatus {
public:
    HostStatus();
    ~HostStatus();
    HostStatus(const HostStatus&) = delete;
    HostStatus& operator=(const HostStatus&) = delete;

    zeerr_Status* get() { return &status_; }

    bool isError() const { return status_.code < 0; }
    bool isWarning() const { return status_.code > 0; }
    std::int32_t code() const { return status_.code; }

    /// The JSON text; empty when there is none.
    std::string text() const;

private:
    zeerr_Status status_;
};

/// Puts a failure of this host into a status that the plug-in lent.
/// @param constant  the name of the code
/// @param info      what happened, for people
void fail(zeerr_Status& status, std::int32_t code, const char* constant, const std::string& info);

} // namespace vantelhost
