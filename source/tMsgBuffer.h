/// @file
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>

#include <endian.h>

#include "errors/Status.h"

namespace zekelVantel {

/// One datagram, written and read in network byte order.
///
/// Reading consumes octets up to the length; writing appends. An operation that gets a status with
/// an error does nothing, and reading then gives 0. Errors: -52012 "zeoskerr_endOfData" when
/// reading past the length or writing past the capacity, -52019 "zeoskerr_bufferTooSmall" for a
/// length beyond the capacity.
class tMsgBuffer {
public:
    /// The largest datagram.
    static constexpr std::uint32_t maximumLength = 1500;

    static constexpr std::uint32_t capacity() { return maximumLength; }

    std::uint32_t getLength() const { return length_; }

    /// Makes the first n octets valid; writing goes on behind them. Reading stays where it is.
    void setLength(std::uint32_t n, zeerr::Status& status);

    /// The octets themselves. The length and both positions stay as they are.
    const std::uint8_t* data() const { return data_.data(); }
    std::uint8_t* data() { return data_.data(); }

    /// Zeroes octets, length and both positions.
    void clear();

    std::uint8_t readU8(zeerr::Status& status);
    std::uint16_t readU16(zeerr::Status& status);
    std::uint32_t readU32(zeerr::Status& status);
    std::uint64_t readU64(zeerr::Status& status);

    /// Reads so many octets and keeps none.
    void skip(std::uint32_t octets, zeerr::Status& status);

    void writeU8(std::uint8_t value, zeerr::Status& status);
    void writeU16(std::uint16_t value, zeerr::Status& status);
    void writeU32(std::uint32_t value, zeerr::Status& status);
    void writeU64(std::uint64_t value, zeerr::Status& status);

private:
    /// Takes a value that is there to its last octet. One that the end cuts is read octet by octet,
    /// which consumes what there is.
    template <typename Integer>
    bool readAtOnce(Integer& octets, const zeerr::Status& status);

    /// Writes a value for which there is room. One that the end cuts is written octet by octet.
    template <typename Integer>
    bool writeAtOnce(Integer octets, const zeerr::Status& status);

    static void reportReadPastEnd(zeerr::Status& status);
    static void reportWritePastEnd(zeerr::Status& status);

    std::array<std::uint8_t, maximumLength> data_{};
    std::uint32_t length_ = 0;
    std::uint32_t readPos_ = 0;
    std::uint32_t writePos_ = 0;
};

// Every octet of every poll goes through these: inline, so that a message costs tens of
// nanoseconds.

inline void tMsgBuffer::clear() {
    data_.fill(0);
    length_ = 0;
    readPos_ = 0;
    writePos_ = 0;
}

inline std::uint8_t tMsgBuffer::readU8(zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return 0;
    }
    if (readPos_ >= length_) {
        reportReadPastEnd(status);
        return 0;
    }
    return data_[readPos_++];
}

template <typename Integer>
bool tMsgBuffer::readAtOnce(Integer& octets, const zeerr::Status& status) {
    if (zeerr::isError(status) || readPos_ + sizeof(octets) > length_) {
        return false;
    }
    std::memcpy(&octets, &data_[readPos_], sizeof(octets));
    readPos_ += sizeof(octets);
    return true;
}

inline std::uint16_t tMsgBuffer::readU16(zeerr::Status& status) {
    if (std::uint16_t octets = 0; readAtOnce(octets, status)) {
        return be16toh(octets);
    }
    const unsigned high = readU8(status);
    return static_cast<std::uint16_t>(high << 8 | readU8(status));
}

inline std::uint32_t tMsgBuffer::readU32(zeerr::Status& status) {
    if (std::uint32_t octets = 0; readAtOnce(octets, status)) {
        return be32toh(octets);
    }
    const std::uint32_t high = readU16(status);
    return high << 16 | readU16(status);
}

inline std::uint64_t tMsgBuffer::readU64(zeerr::Status& status) {
    if (std::uint64_t octets = 0; readAtOnce(octets, status)) {
        return be64toh(octets);
    }
    const std::uint64_t high = readU32(status);
    return high << 32 | readU32(status);
}

inline void tMsgBuffer::skip(std::uint32_t octets, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (readPos_ + octets > length_) {
        readPos_ = std::max(readPos_, length_);
        reportReadPastEnd(status);
        return;
    }
    readPos_ += octets;
}

inline void tMsgBuffer::writeU8(std::uint8_t value, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (writePos_ >= maximumLength) {
        reportWritePastEnd(status);
        return;
    }
    data_[writePos_++] = value;
    if (writePos_ >= length_) {
        ++length_;
    }
}

template <typename Integer>
bool tMsgBuffer::writeAtOnce(Integer octets, const zeerr::Status& status) {
    if (zeerr::isError(status) || maximumLength - writePos_ < sizeof(octets)) {
        return false;
    }
    std::memcpy(&data_[writePos_], &octets, sizeof(octets));
    writePos_ += sizeof(octets);
    length_ += sizeof(octets);
    return true;
}

inline void tMsgBuffer::writeU16(std::uint16_t value, zeerr::Status& status) {
    if (writeAtOnce(htobe16(value), status)) {
        return;
    }
    writeU8(static_cast<std::uint8_t>(value >> 8), status);
    writeU8(static_cast<std::uint8_t>(value & 0xff), status);
}

inline void tMsgBuffer::writeU32(std::uint32_t value, zeerr::Status& status) {
    if (writeAtOnce(htobe32(value), status)) {
        return;
    }
    writeU16(static_cast<std::uint16_t>(value >> 16), status);
    writeU16(static_cast<std::uint16_t>(value & 0xffff), status);
}

inline void tMsgBuffer::writeU64(std::uint64_t value, zeerr::Status& status) {
    if (writeAtOnce(htobe64(value), status)) {
        return;
    }
    writeU32(static_cast<std::uint32_t>(value >> 32), status);
    writeU32(static_cast<std::uint32_t>(value & 0xffffffff), status);
}

} // namespace zekelVantel
