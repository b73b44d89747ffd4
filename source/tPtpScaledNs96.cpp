#include "tPtpScaledNs96.h"

#include "messageFields.h"

namespace zekelVantel {

void tPtpScaledNs96::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readAllOrNothing(*this, buffer, status);
}

void tPtpScaledNs96::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpScaledNs96::size() const {
    return sizeOfFields(*this);
}

} // namespace zekelVantel
