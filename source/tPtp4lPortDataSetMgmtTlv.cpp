#include "tPtp4lPortDataSetMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtp4lPortDataSetMgmtTlv::tPtp4lPortDataSetMgmtTlv()
    : tPtpMgmtTlv(tManagementId::portDataSet, sizeOfFields(Data())) {}

void tPtp4lPortDataSetMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMgmtTlv::deserialize(buffer, status);
    readAllOrNothing(data_, buffer, status);
}

void tPtp4lPortDataSetMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMgmtTlv::serialize(buffer, status);
    writeFields(data_, buffer, status);
}

std::uint32_t tPtp4lPortDataSetMgmtTlv::size() const {
    return tPtpMgmtTlv::size() + sizeOfFields(data_);
}

} // namespace zekelVantel
