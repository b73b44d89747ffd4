#include "tPtp4lPortPropertiesMgmtTlv.h"

#include "messageFields.h"

namespace zekelVantel {

tPtp4lPortPropertiesMgmtTlv::tPtp4lPortPropertiesMgmtTlv()
    : tPtpMgmtTlv(tManagementId::portPropertiesNp, sizeOfFields(Data())) {
    updateLengthField();
}

void tPtp4lPortPropertiesMgmtTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    tPtpMgmtTlv::deserialize(buffer, status);
    readAllOrNothing(data_, buffer, status);
    if (!zeerr::isError(status)) {
        updateLengthField();
    }
}

void tPtp4lPortPropertiesMgmtTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    tPtpMgmtTlv::serialize(buffer, status);
    writeFields(data_, buffer, status);
    if (padded_) {
        buffer.writeU8(0, status);
    }
}

std::uint32_t tPtp4lPortPropertiesMgmtTlv::size() const {
    return tPtpMgmtTlv::size() + sizeOfFields(data_);
}

void tPtp4lPortPropertiesMgmtTlv::updateLengthField() {
    const std::uint32_t length = tPtp4lPortPropertiesMgmtTlv::size() - uncounted;
    padded_ = length % 2 != 0;
    setLengthField(padded_ ? length + 1 : length);
}

} // namespace zekelVantel
