#include "tMsgBuffer.h"

#include "errors/Exception.h"

namespace zekelVantel {

void tMsgBuffer::reportTooLong(zeerr::Status& status) {
    zeerr::setError(status, zeerr::site::bufferTooSmall);
}

void tMsgBuffer::reportReadPastEnd(zeerr::Status& status) {
    zeerr::setError(status, zeerr::site::bufferReadPastEnd);
}

// [oddity write-past-end] End-of-data and not buffer-too-small: for those who read the code, both
// ends are one.
void tMsgBuffer::reportWritePastEnd(zeerr::Status& status) {
    zeerr::setError(status, zeerr::site::bufferWritePastEnd);
}

} // namespace zekelVantel
