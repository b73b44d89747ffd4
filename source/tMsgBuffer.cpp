#include "tMsgBuffer.h"

#include "errors/Exception.h"

namespace zekelVantel {

void tMsgBuffer::setLength(std::uint32_t n, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (n > maximumLength) {
        zeerr::setError(status, zeerr::site::bufferTooSmall);
        return;
    }
    length_ = n;
    writePos_ = n;
}

std::uint8_t tMsgBuffer::readU8(zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return 0;
    }
    if (readPos_ >= length_) {
        zeerr::setError(status, zeerr::site::bufferReadPastEnd);
        return 0;
    }
    return data_[readPos_++];
}

std::uint16_t tMsgBuffer::readU16(zeerr::Status& status) {
    const unsigned high = readU8(status);
    return static_cast<std::uint16_t>(high << 8 | readU8(status));
}

std::uint32_t tMsgBuffer::readU32(zeerr::Status& status) {
    const std::uint32_t high = readU16(status);
    return high << 16 | readU16(status);
}

std::uint64_t tMsgBuffer::readU64(zeerr::Status& status) {
    const std::uint64_t high = readU32(status);
    return high << 32 | readU32(status);
}

void tMsgBuffer::writeU8(std::uint8_t value, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (writePos_ >= maximumLength) {
        // [oddity write-past-end] End-of-data and not buffer-too-small: for those who read the
        // code, both ends are one.
        zeerr::setError(status, zeerr::site::bufferWritePastEnd);
        return;
    }
    data_[writePos_++] = value;
    if (writePos_ >= length_) {
        ++length_;
    }
}

void tMsgBuffer::writeU16(std::uint16_t value, zeerr::Status& status) {
    writeU8(static_cast<std::uint8_t>(value >> 8), status);
    writeU8(static_cast<std::uint8_t>(value & 0xff), status);
}

void tMsgBuffer::writeU32(std::uint32_t value, zeerr::Status& status) {
    writeU16(static_cast<std::uint16_t>(value >> 16), status);
    writeU16(static_cast<std::uint16_t>(value & 0xffff), status);
}

void tMsgBuffer::writeU64(std::uint64_t value, zeerr::Status& status) {
    writeU32(static_cast<std::uint32_t>(value >> 32), status);
    writeU32(static_cast<std::uint32_t>(value & 0xffffffff), status);
}

} // namespace zekelVantel
