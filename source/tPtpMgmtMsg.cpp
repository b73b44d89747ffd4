#include "tPtpMgmtMsg.h"

#include "messageFields.h"

namespace zekelVantel {

tPtpMgmtMsg::tPtpMgmtMsg() {
    setLogMessageInterval(0x7f);
}

void tPtpMgmtMsg::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMsgHeader::deserialize(buffer, status);
    readEachField(body_, buffer, status);
}

void tPtpMgmtMsg::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMsgHeader::serialize(buffer, status);
    writeFields(body_, buffer, status);
}

std::uint32_t tPtpMgmtMsg::size() const {
    return tPtpMsgHeader::size() + sizeOfFields(body_);
}

} // namespace zekelVantel
