/// @file
#pragma once

#include <string>

namespace vantelhost {

/// The longest that a socket can have. Plug-in and ptp4l cut what is longer.
constexpr std::size_t longestSocketPath = 107;

struct SocketUse {
    int error;            ///< why nobody can be reached there: errno; 0 when somebody can
    std::string listener; ///< who: "ptp4l (process 12), started by init (process 1)", or "somebody"
                          ///< when that is not to be seen; empty when nobody can be reached
};

/// Who listens at a socket's path, which is cut first. Nothing is sent.
SocketUse useOfSocket(const std::string& path, const std::string& proc = "/proc");

} // namespace vantelhost
