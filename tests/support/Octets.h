/// @file
/// Messages as literal octets, with nothing of the code under test between them and the buffer.
#pragma once

#include <cctype>
#include <cstdint>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "iMsgSerializable.h"

using Octets = std::vector<std::uint8_t>;

/// The code of a datagram that ends too early.
constexpr std::int32_t endOfData = -52012;

/// Octets from pairs of hexadecimal digits. Blanks are for the reader.
inline Octets octets(const std::string& hexadecimal) {
    std::string digits;
    for (const char character : hexadecimal) {
        if (std::isxdigit(static_cast<unsigned char>(character)) != 0) {
            digits += character;
        }
    }
    Octets result;
    for (std::size_t at = 0; at + 2 <= digits.size(); at += 2) {
        result.push_back(static_cast<std::uint8_t>(std::stoul(digits.substr(at, 2), nullptr, 16)));
    }
    return result;
}

inline Octets operator+(Octets front, const Octets& back) {
    front.insert(front.end(), back.begin(), back.end());
    return front;
}

/// The first `count` octets.
inline Octets first(std::size_t count, const Octets& all) {
    return {all.begin(), all.begin() + static_cast<std::ptrdiff_t>(count)};
}

/// All but the first `count` octets.
inline Octets behind(std::size_t count, const Octets& all) {
    return {all.begin() + static_cast<std::ptrdiff_t>(count), all.end()};
}

/// A buffer as a receive leaves it.
inline zekelVantel::tMsgBuffer received(const Octets& datagram) {
    zekelVantel::tMsgBuffer buffer;
    zeerr::LocalStatus status;
    for (std::size_t at = 0; at < datagram.size() && at < buffer.capacity(); ++at) {
        buffer.data()[at] = datagram[at];
    }
    buffer.setLength(static_cast<std::uint32_t>(datagram.size()), status);
    EXPECT_EQ(status.code, 0);
    return buffer;
}

/// The valid octets of a buffer.
inline Octets contentOf(const zekelVantel::tMsgBuffer& buffer) {
    return {buffer.data(), buffer.data() + buffer.getLength()};
}

/// What an object sends.
inline Octets serialized(const zekelVantel::iMsgSerializable& object) {
    zekelVantel::tMsgBuffer buffer;
    zeerr::LocalStatus status;
    object.serialize(buffer, status);
    EXPECT_EQ(status.code, 0);
    return contentOf(buffer);
}

/// Reads an object from a datagram. @return the code of the status.
inline std::int32_t readInto(zekelVantel::iMsgSerializable& object, const Octets& datagram) {
    zekelVantel::tMsgBuffer buffer = received(datagram);
    zeerr::LocalStatus status;
    object.deserialize(buffer, status);
    return status.code;
}

/// An object that was read from a datagram without a failure.
template <typename Object>
Object readFrom(const Octets& datagram) {
    Object object;
    EXPECT_EQ(readInto(object, datagram), 0);
    return object;
}

/// How many octets of a datagram an object reads.
inline std::size_t octetsConsumed(zekelVantel::iMsgSerializable& object, const Octets& datagram) {
    zekelVantel::tMsgBuffer buffer = received(datagram);
    zeerr::LocalStatus status;
    object.deserialize(buffer, status);
    EXPECT_EQ(status.code, 0);
    std::size_t left = 0;
    for (buffer.readU8(status); status.code == 0; buffer.readU8(status)) {
        ++left;
    }
    return datagram.size() - left;
}

/// An object that was read from `before` takes over, when `next` is cut, every field that was there
/// whole, and keeps the others. `ends` says where each field ends.
inline void expectEachFieldAsItIsRead(zekelVantel::iMsgSerializable& object, const Octets& before,
                                      const Octets& next, const std::vector<std::size_t>& ends) {
    for (std::size_t length = 0; length < next.size(); ++length) {
        Octets expected = before;
        for (std::size_t field = 0; field < ends.size() && ends[field] <= length; ++field) {
            for (std::size_t at = field == 0 ? 0 : ends[field - 1]; at < ends[field]; ++at) {
                expected[at] = next[at];
            }
        }
        EXPECT_EQ(readInto(object, before), 0);
        EXPECT_EQ(readInto(object, first(length, next)), endOfData) << length;
        EXPECT_EQ(serialized(object), expected) << length;
    }
}
