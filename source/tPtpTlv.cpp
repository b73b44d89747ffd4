#include "tPtpTlv.h"

#include "messageFields.h"

namespace zekelVantel {

void tPtpTlv::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    readEachField(*this, buffer, status);
}

void tPtpTlv::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    writeFields(*this, buffer, status);
}

std::uint32_t tPtpTlv::size() const {
    return sizeOfFields(*this);
}

void tPtpTlv::setLengthField(std::uint32_t octets) {
    lengthField_ = static_cast<std::uint16_t>(octets);
}

} // namespace zekelVantel
