#include "tPtpMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtpMgmtTlv::tPtpMgmtTlv(tManagementId managementId, std::uint32_t dataSize)
    : managementId_(static_cast<std::uint16_t>(managementId)) {
    setLengthField(tPtpMgmtTlv::size() - uncounted + dataSize);
}

void tPtpMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readEachField(*this, buffer, status);
}

void tPtpMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpMgmtTlv::size() const {
    return sizeOfFields(*this);
}

} // namespace zekelVantel
