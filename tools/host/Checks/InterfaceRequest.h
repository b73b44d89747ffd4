/// @file
#pragma once

#include <string>

#include <net/if.h>

namespace vantelhost {

/// Asks the kernel about a network interface: netdevice(7).
class InterfaceRequest {
public:
    /// @param interface its name, of which the kernel knows 15 characters
    explicit InterfaceRequest(const std::string& interface);

    ifreq& get() { return request_; }

    /// @return 0, or errno.
    int ask(unsigned long operation);

private:
    ifreq request_{};
};

} // namespace vantelhost
