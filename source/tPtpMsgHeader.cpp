#include "tPtpMsgHeader.h"

#include "messageFields.h"

namespace zekelVantel {

void tPtpMsgHeader::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readEachField(*this, buffer, status);
}

void tPtpMsgHeader::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpMsgHeader::size() const {
    return sizeOfFields(*this);
}

} // namespace zekelVantel
