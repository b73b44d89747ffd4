#include "tPtpClockIdentity.h"

namespace zekelVantel {

tPtpClockIdentity::tPtpClockIdentity(std::uint64_t value) {
    for (auto octet = identity_.rbegin(); octet != identity_.rend(); ++octet) {
        *octet = static_cast<std::uint8_t>(value & 0xff);
        value >>= 8;
    }
}

void tPtpClockIdentity::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    const tPtpClockIdentity whole(buffer.readU64(status));
    if (!zeerr::isError(status)) {
        *this = whole;
    }
}

void tPtpClockIdentity::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    for (const std::uint8_t octet : identity_) {
        buffer.writeU8(octet, status);
    }
}

std::uint32_t tPtpClockIdentity::size() const {
    return static_cast<std::uint32_t>(identity_.size());
}

} // namespace zekelVantel
