#include "tPtp4lParentDataSetMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtp4lParentDataSetMgmtTlv::tPtp4lParentDataSetMgmtTlv()
    : tPtpMgmtTlv(tManagementId::parentDataSet, sizeOfFields(Data())) {}

void tPtp4lParentDataSetMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMgmtTlv::deserialize(buffer, status);
    readAllOrNothing(data_, buffer, status);
}

void tPtp4lParentDataSetMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMgmtTlv::serialize(buffer, status);
    writeFields(data_, buffer, status);
}

std::uint32_t tPtp4lParentDataSetMgmtTlv::size() const {
    return tPtpMgmtTlv::size() + sizeOfFields(data_);
}

} // namespace zekelVantel
