#include "tPtpPortIdentity.h"

#include "messageFields.h"

namespace zekelVantel {

tPtpPortIdentity::tPtpPortIdentity(const tPtpClockIdentity& clockIdentity, std::uint16_t portNumber)
    : clockIdentity_(clockIdentity), portNumber_(portNumber) {}

void tPtpPortIdentity::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readAllOrNothing(*this, buffer, status);
}

void tPtpPortIdentity::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpPortIdentity::size() const {
    return sizeOfFields(*this);
}

} // namespace zekelVantel
