#include "paths.h"

namespace zekelVantel {

const char* const ptp4lPath = VANTEL_PTP4L_PATH;
const char* const epochFifoPath = VANTEL_EPOCH_FIFO_PATH;
const char* const localSocketPrefix = VANTEL_LOCAL_SOCKET_PREFIX;

} // namespace zekelVantel
