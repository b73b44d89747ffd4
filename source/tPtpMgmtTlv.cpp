#include "tPtpMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtpMgmtTlv::tPtpMgmtTlv(tManagementId managementId, std::uint32_t dataSize)
    : head_{static_cast<std::uint16_t>(managementId)} {
    setLengthField(tPtpMgmtTlv::size() - uncounted + dataSize);
}

void tPtpMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpTlv::deserialize(buffer, status);
    readEachField(head_, buffer, status);
}

void tPtpMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpTlv::serialize(buffer, status);
    writeFields(head_, buffer, status);
}

std::uint32_t tPtpMgmtTlv::size() const {
    return tPtpTlv::size() + sizeOfFields(head_);
}

} // namespace zekelVantel
