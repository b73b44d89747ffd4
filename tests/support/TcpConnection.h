/// @file
#pragma once

#include "support/Descriptor.h"

/// A connection to a port of this machine over IPv4; none when nobody listens. Waits for 5 s at
/// most to read or write.
Descriptor connectTo(int port);

/// Listens on a free port of this machine over IPv4, and answers nothing.
class SilentListener {
public:
    SilentListener();

    int port() const { return port_; }

private:
    Descriptor socket_;
    int port_ = 0;
};
