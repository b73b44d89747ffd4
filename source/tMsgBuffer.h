/// @file
#pragma once

#include <array>
#include <cstdint>

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
    void clear() { *this = tMsgBuffer(); }

    std::uint8_t readU8(zeerr::Status& status);
    std::uint16_t readU16(zeerr::Status& status);
    std::uint32_t readU32(zeerr::Status& status);
    std::uint64_t readU64(zeerr::Status& status);

    void writeU8(std::uint8_t value, zeerr::Status& status);
    void writeU16(std::uint16_t value, zeerr::Status& status);
    void writeU32(std::uint32_t value, zeerr::Status& status);
    void writeU64(std::uint64_t value, zeerr::Status& status);

private:
    std::array<std::uint8_t, maximumLength> data_{};
    std::uint32_t length_ = 0;
    std::uint32_t readPos_ = 0;
    std::uint32_t writePos_ = 0;
};

} // namespace zekelVantel
