#include "tPtpClockQuality.h"

#include "messageFields.h"

namespace zekelVantel {

void tPtpClockQuality::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readAllOrNothing(*this, buffer, status);
}

void tPtpClockQuality::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpClockQuality::size() const {
    return sizeOfFields(*this);
}

} // namespace zekelVantel
