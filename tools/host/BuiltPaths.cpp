#include "BuiltPaths.h"

namespace vantelhost {

const char* const builtPtp4l = VANTEL_PTP4L_PATH;
const char* const builtEpochFifo = VANTEL_EPOCH_FIFO_PATH;
const char* const builtSocketPrefix = VANTEL_LOCAL_SOCKET_PREFIX;

} // namespace vantelhost
