/// @file
/// The paths that depend on the machine. Set when the library is built (CMake: VANTEL_PTP4L_PATH,
/// VANTEL_EPOCH_FIFO_PATH, VANTEL_LOCAL_SOCKET_PREFIX).
#pragma once

namespace zekelVantel {

/// The PTP daemon.
extern const char* const ptp4lPath;

/// The FIFO that carries epoch offsets.
extern const char* const epochFifoPath;

/// The plug-in's own socket; the process id in decimal follows.
extern const char* const localSocketPrefix;

} // namespace zekelVantel
