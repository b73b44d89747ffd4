#include "tPtp4lDefaultDataSetMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtp4lDefaultDataSetMgmtTlv::tPtp4lDefaultDataSetMgmtTlv()
    : tPtpMgmtTlv(tManagementId::defaultDataSet, sizeOfFields(Data())) {}

void tPtp4lDefaultDataSetMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMgmtTlv::deserialize(buffer, status);
    readAllOrNothing(data_, buffer, status);
}

void tPtp4lDefaultDataSetMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMgmtTlv::serialize(buffer, status);
    writeFields(data_, buffer, status);
}

std::uint32_t tPtp4lDefaultDataSetMgmtTlv::size() const {
    return tPtpMgmtTlv::size() + sizeOfFields(data_);
}

} // namespace zekelVantel
