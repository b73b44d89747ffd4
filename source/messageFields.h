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
/// A field is an integer, in network byte order, octets as they stand, or another object: one with
/// such a list, too, or one that reads and writes itself.
#pragma once

#include <array>
#include <cstdint>
#include <type_traits>
#include <utility>

#include <endian.h>

#include "errors/Status.h"
#include "tMsgBuffer.h"

namespace zekelVantel {

/// Whether an object says how many octets it has only when it is read: it has a member of that
/// name.
template <typename Fields, typename = void>
inline constexpr bool isVariable = false;
template <typename Fields>
inline constexpr bool isVariable<Fields, std::void_t<decltype(Fields::isVariable)>> = true;

template <typename Integer>
Integer swappedIfLittleEndian(Integer octets) {
    if constexpr (sizeof(octets) == 1) {
        return octets;
    } else if constexpr (sizeof(octets) == 2) {
        return static_cast<Integer>(be16toh(static_cast<std::uint16_t>(octets)));
    } else if constexpr (sizeof(octets) == 4) {
        return static_cast<Integer>(be32toh(static_cast<std::uint32_t>(octets)));
    } else {
        static_assert(sizeof(octets) == 8);
        return static_cast<Integer>(be64toh(static_cast<std::uint64_t>(octets)));
    }
}

// Fields are not copied by std::memcpy: the C library may check it, and the checks look large
// enough to GCC to keep from being inlined what copies one octet. There is room for each.

/// Reads fields of which every octet is there.
class tWholeReader {
public:
    /// @param octets moves behind what is read.
    explicit tWholeReader(const std::uint8_t*& octets) : octets_(octets) {}

    template <typename... Fields>
    void operator()(Fields&... fields) const {
        (field(fields), ...);
    }

    void nibbles(std::uint8_t& high, std::uint8_t& low) const {
        field(low);
        high = static_cast<std::uint8_t>(low >> 4);
        low &= 0x0f;
    }

    void lowNibble(std::uint8_t& low) const {
        field(low);
        low &= 0x0f;
    }

    void reserved(unsigned octets) const { octets_ += octets; }

private:
    template <typename Field>
    void field(Field& value) const {
        if constexpr (std::is_integral_v<Field>) {
            __builtin_memcpy(&value, octets_, sizeof(value));
            value = swappedIfLittleEndian(value);
            octets_ += sizeof(value);
        } else {
            Field::visitFields(value, *this);
        }
    }

    template <std::size_t size>
    void field(std::array<std::uint8_t, size>& value) const {
        __builtin_memcpy(value.data(), octets_, size);
        octets_ += size;
    }

    const std::uint8_t*& octets_;
};

/// Writes fields of which every octet has its room.
class tWholeWriter {
public:
    /// @param octets moves behind what is written.
    explicit tWholeWriter(std::uint8_t*& octets) : octets_(octets) {}

    template <typename... Fields>
    void operator()(const Fields&... fields) const {
        (field(fields), ...);
    }

    void nibbles(std::uint8_t high, std::uint8_t low) const {
        field(static_cast<std::uint8_t>(high << 4 | low));
    }

    void lowNibble(std::uint8_t low) const { field(low); }

    void reserved(unsigned octets) const {
        __builtin_memset(octets_, 0, octets);
        octets_ += octets;
    }

private:
    template <typename Field>
    void field(const Field& value) const {
        if constexpr (std::is_integral_v<Field>) {
            const Field octets = swappedIfLittleEndian(value);
            __builtin_memcpy(octets_, &octets, sizeof(octets));
            octets_ += sizeof(octets);
        } else {
            Field::visitFields(value, *this);
        }
    }

    template <std::size_t size>
    void field(const std::array<std::uint8_t, size>& value) const {
        __builtin_memcpy(octets_, value.data(), size);
        octets_ += size;
    }

    std::uint8_t*& octets_;
};

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
        } else if constexpr (isVariable<Field>) {
            octets_ += value.size();
        } else {
            Field::visitFields(value, *this);
        }
    }

    template <std::size_t size>
    void field(const std::array<std::uint8_t, size>& /*value*/) const {
        octets_ += size;
    }

    std::uint32_t& octets_;
};

/// Octets that the fields take on the wire.
template <typename Fields>
std::uint32_t sizeOfFields(const Fields& fields) {
    std::uint32_t octets = 0;
    Fields::visitFields(fields, tFieldSizer(octets));
    return octets;
}

/// Reads the fields of an object that the end cuts. Kept out of the way of those that are whole.
template <typename Fields>
[[gnu::cold]] void readUpToEnd(Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    Fields::visitFields(fields, tFieldReader(buffer, status));
}

/// Writes the fields of an object that the capacity cuts.
template <typename Fields>
[[gnu::cold]] void writeUpToEnd(const Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    Fields::visitFields(fields, tFieldWriter(buffer, status));
}

/// Reads all fields, if they are there to the last octet.
template <typename Fields>
bool readAtOnce(Fields& fields, tMsgBuffer& buffer, const zeerr::Status& status) {
    if constexpr (!isVariable<Fields>) {
        if (const std::uint8_t* octets = buffer.take(sizeOfFields(fields), status)) {
            Fields::visitFields(fields, tWholeReader(octets));
            return true;
        }
    }
    return false;
}

/// Store rule "each field as it is read": what was read before the buffer ended stays read.
template <typename Fields>
void readEachField(Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    if (!readAtOnce(fields, buffer, status)) {
        readUpToEnd(fields, buffer, status);
    }
}

/// Store rule "all or nothing": an object that could not be read whole keeps all its values.
template <typename Fields>
void readAllOrNothing(Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    if (readAtOnce(fields, buffer, status)) {
        return;
    }
    Fields whole;
    if constexpr (isVariable<Fields>) {
        Fields::visitFields(whole, tFieldReader(buffer, status));
    } else {
        readUpToEnd(whole, buffer, status);
    }
    if (!zeerr::isError(status)) {
        fields = std::move(whole);
    }
}

template <typename Fields>
void writeFields(const Fields& fields, tMsgBuffer& buffer, zeerr::Status& status) {
    if constexpr (!isVariable<Fields>) {
        if (std::uint8_t* octets = buffer.append(sizeOfFields(fields), status)) {
            Fields::visitFields(fields, tWholeWriter(octets));
        } else {
            writeUpToEnd(fields, buffer, status);
        }
    } else {
        Fields::visitFields(fields, tFieldWriter(buffer, status));
    }
}

} // namespace zekelVantel
