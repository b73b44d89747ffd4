/// @file
/// Reading, writing and sizing messages from one list of their fields.
///
/// A class names its fields once, in wire order:
///
///     template <typename Self, typename Visitor>
///     static void visitFields(Self& self, Visitor visit) {
///         visit(self.clockClass, self.clockAccuracy);
///     }
///
/// A field is an integer, in network byte order, or another object with fields of its own.
#pragma once

#include <cstdint>
#include <type_traits>

#include "errors/Status.h"
#include "tMsgBuffer.h"

namespace zekelVantel {

/// Stores each field as it is read; once the status holds an error, the rest keep their values.
class tFieldReader {
public:
    tFieldReader(tMsgBuffer& buffer, zeerr::Status& status) : buffer_(buffer), status_(status) {}

    template <typename... Fields>
    void operator()(Fields&... fields) const {
        (field(fields), ...);
    }

    /// One octet that carries two fields.
    void nibbles(std::uint8_t& high, std::uint8_t& low) const {
        auto octet = static_cast<std::uint8_t>(high << 4 | low);
        field(octet);
        high = static_cast<std::uint8_t>(octet >> 4);
        low = octet & 0x0f;
    }

    /// One octet of which only the low half is kept.
    void lowNibble(std::uint8_t& low) const {
        field(low);
        low &= 0x0f;
    }

    /// Octets that are neither interpreted nor kept.
    void reserved(unsigned octets) const { buffer_.skip(octets, status_); }

private:
    template <typename Field>
    void field(Field& value) const {
        if constexpr (std::is_integral_v<Field>) {
            const auto octets = read<sizeof(Field)>();
            if (!zeerr::isError(status_)) {
                value = static_cast<Field>(octets);
            }
        } else {
            value.deserialize(buffer_, status_);
        }
    }

    template <std::size_t size>
    auto read() const {
        if constexpr (size == 1) {
            return buffer_.readU8(status_);
        } else if constexpr (size == 2) {
            return buffer_.readU16(status_);
        } else if constexpr (size == 4) {
            return buffer_.readU32(status_);
        } else {
            static_assert(size == 8);
            return buffer_.readU64(status_);
        }
    }

    tMsgBuffer& buffer_;
    zeerr::Status& status_;
};

class tFieldWriter {
public:
    tFieldWriter(tMsgBuffer& buffer, zeerr::Status& status) : buffer_(buffer), status_(status) {}

    template <typename... Fields>
    void operator()(const Fields&... fields) const {
        (field(fields), ...);
    }

    void nibbles(std::uint8_t high, std::uint8_t low) const {
        buffer_.writeU8(static_cast<std::uint8_t>(high << 4 | low), status_);
    }

    void lowNibble(std::uint8_t low) const { buffer_.writeU8(low, status_); }

    void reserved(unsigned octets) const {
        for (unsigned octet = 0; octet < octets; ++octet) {
            buffer_.writeU8(0, status_);
        }
    }

private:
    template <typename Field>
    void field(const Field& value) const {
        if constexpr (!std::is_integral_v<Field>) {
            value.serialize(buffer_, status_);
        } else if constexpr (sizeof(Field) == 1) {
            buffer_.writeU8(static_cast<std::uint8_t>(value), status_);
        } else if constexpr (sizeof(Field) == 2) {
            buffer_.writeU16(static_cast<std::uint16_t>(value), status_);
        } else if constexpr (sizeof(Field) == 4) {
            buffer_.writeU32(static_cast<std::uint32_t>(value), status_);
        } else {
            static_assert(sizeof(Field) == 8);
            buffer_.writeU64(static_cast<std::uint64_t>(value), status_);
        }
    }

    tMsgBuffer& buffer_;
    zeerr::Status& status_;
};

class tFieldSizer {
public:
    explicit tFieldSizer(std::uint32_t& octets) : octets_(octets) {}

    template <typename... Fields>
    void operator()(const Fields&... fields) const {
        (field(fields), ...);
    }

    void nibbles(std::uint8_t /*high*/, std::uint8_t /*low*/) const { octets_ += 1; }
    void lowNibble(std::uint8_t /*low*/) const { octets_ += 1; }
    void reserved(unsigned octets) const { octets_ += octets; }

private:
    template <typename Field>
    void field(const Field& value) const {
        if constexpr (std::is_integral_v<Field>) {
            octets_ += sizeof(Field);
        } else {
            octets_ += value.size();
        }
    }

    std::uint32_t& octets_;
};

/// Store rule "each field as it is read": what was read before the buffer ended stays read.
template <typename Fields>
void readEachField(Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    Fields::visitFields(fields, tFieldReader(buffer, status));
}

/// Store rule "all or nothing": an object that could not be read whole keeps all its values.
template <typename Fields>
void readAllOrNothing(Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    Fields whole = fields;
    readEachField(whole, buffer, status);
    if (!zeerr::isError(status)) {
        fields = whole;
    }
}

template <typename Fields>
void writeFields(const Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    Fields::visitFields(fields, tFieldWriter(buffer, status));
}

/// Octets that the fields take on the wire.
template <typename Fields>
std::uint32_t sizeOfFields(const Fields& fields) {
    std::uint32_t octets = 0;
    Fields::visitFields(fields, tFieldSizer(octets));
    return octets;
}

} // namespace zekelVantel
