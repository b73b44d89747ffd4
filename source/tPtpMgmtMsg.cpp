#include "tPtpMgmtMsg.h"

#include "messageFields.h"

namespace zekelVantel {

tPtpMgmtMsg::tPtpMgmtMsg() {
    setLogMessageInterval(0x7f);
}

void tPtpMgmtMsg::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readEachField(*this, buffer, status);
}

void tPtpMgmtMsg::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpMgmtMsg::size() const {
    return sizeOfFields(*this);
}

} // namespace zekelVantel
