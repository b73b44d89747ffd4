/// @file
/// The paths of the plug-in that was built with this host (CMake: VANTEL_PTP4L_PATH,
/// VANTEL_EPOCH_FIFO_PATH, VANTEL_LOCAL_SOCKET_PREFIX).
#pragma once

namespace vantelhost {

/// The PTP daemon.
extern const char* const builtPtp4l;

/// The FIFO that carries epoch offsets.
extern const char* const builtEpochFifo;

/// The plug-in's own socket; the process id in decimal follows.
extern const char* const builtSocketPrefix;

} // namespace vantelhost
