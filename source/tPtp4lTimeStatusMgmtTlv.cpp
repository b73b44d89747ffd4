#include "tPtp4lTimeStatusMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtp4lTimeStatusMgmtTlv::tPtp4lTimeStatusMgmtTlv()
    : tPtpMgmtTlv(tManagementId::timeStatusNp, sizeOfFields(Data())) {}

void tPtp4lTimeStatusMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMgmtTlv::deserialize(buffer, status);
    readEachField(data_, buffer, status);
}

void tPtp4lTimeStatusMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMgmtTlv::serialize(buffer, status);
    writeFields(data_, buffer, status);
}

std::uint32_t tPtp4lTimeStatusMgmtTlv::size() const {
    return tPtpMgmtTlv::size() + sizeOfFields(data_);
}

} // namespace zekelVantel
