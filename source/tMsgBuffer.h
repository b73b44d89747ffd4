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

    /// The octets themselves. The length and the position of reading stay as they are.
    const std::uint8_t* data() const { return data_.data(); }
    std::uint8_t* data() {
        touched_ = maximumLength;
        return data_.data();
    }

    /// Takes a datagram over whose octets `receive(std::uint8_t* octets, std::uint32_t capacity)`
    /// writes, and of which it returns the length, or a negative number and has written nothing.
    /// @return what it returned.
    template <typename Receive>
    std::int64_t fill(Receive receive, zeerr::Status& status);

    /// Zeroes octets, length and the position of reading.
    void clear();

    /// Consumes so many octets at once.
    /// @return where they are; null, and nothing is consumed, when there are less or the status
    ///         holds an error.
    const std::uint8_t* take(std::uint32_t octets, const zeerr::Status& status);

    /// Appends so many octets at once, which are the caller's to write.
    /// @return where they are; null, and nothing is appended, when there is no room for all or the
    ///         status holds an error.
    std::uint8_t* append(std::uint32_t octets, const zeerr::Status& status);

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

    [[gnu::cold]] static void reportTooLong(zeerr::Status& status);
    [[gnu::cold]] static void reportReadPastEnd(zeerr::Status& status);
    [[gnu::cold]] static void reportWritePastEnd(zeerr::Status& status);

    std::array<std::uint8_t, maximumLength> data_{};
    std::uint32_t length_ = 0;
    std::uint32_t readPos_ = 0;
    std::uint32_t touched_ = 0; ///< octets behind it are 0, but for those up to the length
};

// Every octet of every poll goes through these: inline, so that a message costs tens of
// nanoseconds. For that reason, no std::memcpy: see messageFields.h.

inline void tMsgBuffer::clear() {
    std::memset(data_.data(), 0, std::max(touched_, length_));
    length_ = 0;
    readPos_ = 0;
    touched_ = 0;
}

inline void tMsgBuffer::setLength(std::uint32_t n, zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    if (n > maximumLength) {
        reportTooLong(status);
        return;
    }
    touched_ = std::max(touched_, length_);
    length_ = n;
}

template <typename Receive>
std::int64_t tMsgBuffer::fill(Receive receive, zeerr::Status& status) {
    const std::int64_t received = receive(data_.data(), maximumLength);
    if (received >= 0) {
        setLength(static_cast<std::uint32_t>(received), status);
    }
    return received;
}

inline const std::uint8_t* tMsgBuffer::take(std::uint32_t octets, const zeerr::Status& status) {
    if (zeerr::isError(status) || readPos_ + octets > length_) {
        return nullptr;
    }
    const std::uint8_t* const taken = data_.data() + readPos_;
    readPos_ += octets;
    return taken;
}

inline std::uint8_t* tMsgBuffer::append(std::uint32_t octets, const zeerr::Status& status) {
    if (zeerr::isError(status) || maximumLength - length_ < octets) {
        return nullptr;
    }
    std::uint8_t* const appended = data_.data() + length_;
    length_ += octets;
    return appended;
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
    const std::uint8_t* const taken = take(sizeof(octets), status);
    if (taken == nullptr) {
        return false;
    }
    __builtin_memcpy(&octets, taken, sizeof(octets));
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
    if (length_ >= maximumLength) {
        reportWritePastEnd(status);
        return;
    }
    data_[length_++] = value;
}

template <typename Integer>
bool tMsgBuffer::writeAtOnce(Integer octets, const zeerr::Status& status) {
    std::uint8_t* const appended = append(sizeof(octets), status);
    if (appended == nullptr) {
        return false;
    }
    __builtin_memcpy(appended, &octets, sizeof(octets));
    return true;
}

inline void tMsgBuffer::writeU16(std::uint16_t value, zeerr::Status& status) {
    if (writeAtOnce(htobe16(value), status)) {
        return;
    }
    writeU8(static_cast<std::uint8_t>(value >> 8), status);
    writeU8(static_cast<std::uint8_t>(value), status);
}

inline void tMsgBuffer::writeU32(std::uint32_t value, zeerr::Status& status) {
    if (writeAtOnce(htobe32(value), status)) {
        return;
    }
    writeU16(static_cast<std::uint16_t>(value >> 16), status);
    writeU16(static_cast<std::uint16_t>(value), status);
}

inline void tMsgBuffer::writeU64(std::uint64_t value, zeerr::Status& status) {
    if (writeAtOnce(htobe64(value), status)) {
        return;
    }
    writeU32(static_cast<std::uint32_t>(value >> 32), status);
    writeU32(static_cast<std::uint32_t>(value), status);
}

} // namespace zekelVantel
