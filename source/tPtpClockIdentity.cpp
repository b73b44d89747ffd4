#include "tPtpClockIdentity.h"

#include <cstring>

#include <endian.h>

namespace zekelVantel {

tPtpClockIdentity::tPtpClockIdentity(std::uint64_t value) {
    const std::uint64_t octets = htobe64(value);
    std::memcpy(identity_.data(), &octets, sizeof(octets));
}

void tPtpClockIdentity::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    const std::uint64_t octets = htobe64(buffer.readU64(status));
    if (!zeerr::isError(status)) {
        std::memcpy(identity_.data(), &octets, sizeof(octets));
    }
}

void tPtpClockIdentity::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    std::uint64_t octets = 0;
    std::memcpy(&octets, identity_.data(), sizeof(octets));
    buffer.writeU64(be64toh(octets), status);
}

std::uint32_t tPtpClockIdentity::size() const {
    return static_cast<std::uint32_t>(identity_.size());
}

} // namespace zekelVantel
