#include "tPtp4lPortDataSetNpMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtp4lPortDataSetNpMgmtTlv::tPtp4lPortDataSetNpMgmtTlv()
    : tPtpMgmtTlv(tManagementId::portDataSetNp, sizeOfFields(Data())) {}

void tPtp4lPortDataSetNpMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMgmtTlv::deserialize(buffer, status);
    readAllOrNothing(data_, buffer, status);
}

void tPtp4lPortDataSetNpMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMgmtTlv::serialize(buffer, status);
    writeFields(data_, buffer, status);
}

std::uint32_t tPtp4lPortDataSetNpMgmtTlv::size() const {
    return tPtpMgmtTlv::size() + sizeOfFields(data_);
}

} // namespace zekelVantel
