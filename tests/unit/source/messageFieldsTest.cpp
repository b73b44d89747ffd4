#include "messageFields.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::readAllOrNothing;
using zekelVantel::readEachField;
using zekelVantel::sizeOfFields;
using zekelVantel::tMsgBuffer;
using zekelVantel::writeFields;

namespace {

struct Inner {
    std::uint16_t value = 0x3132;

    std::uint32_t size() const { return 2; }
    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
        readAllOrNothing(*this, buffer, status);
    }
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
        writeFields(*this, buffer, status);
    }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.value);
    }
};

/// One of every kind of field.
struct Everything {
    std::uint8_t high = 0x1;
    std::uint8_t low = 0x2;
    std::uint8_t half = 0x3;
    std::int8_t signed8 = 0x11;
    std::int16_t signed16 = 0x1213;
    std::uint32_t unsigned32 = 0x14151617;
    std::int64_t signed64 = 0x18191A1B1C1D1E1F;
    Inner inner;

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit.nibbles(self.high, self.low);
        visit.lowNibble(self.half);
        visit.reserved(2);
        visit(self.signed8, self.signed16, self.unsigned32, self.signed64, self.inner);
    }
};

class MessageFieldsTest : public testing::Test {
protected:
    Octets written() {
        tMsgBuffer buffer;
        writeFields(fields, buffer, status);
        return contentOf(buffer);
    }

    const Octets before = octets("12 03 0000 11 1213 14151617 18191A1B1C1D1E1F 3132");
    const Octets next = octets("AB CD E1E2 81 8283 84858687 88898A8B8C8D8E8F F1F2");
    const Octets nextWithoutReserved = octets("AB 0D 0000 81 8283 84858687 88898A8B8C8D8E8F F1F2");
    Everything fields;
    zeerr::LocalStatus status;
};

TEST_F(MessageFieldsTest, FieldsAreWrittenInTheOrderOfTheirList) {
    EXPECT_EQ(written(), before);
    EXPECT_EQ(status.code, 0);
}

TEST_F(MessageFieldsTest, WhatFitsIsWrittenWhereverTheRoomEnds) {
    for (std::size_t room = 0; room < before.size(); ++room) {
        const std::size_t filled = tMsgBuffer::capacity() - room;
        tMsgBuffer buffer;
        zeerr::LocalStatus failed;
        buffer.setLength(static_cast<std::uint32_t>(filled), failed);
        writeFields(fields, buffer, failed);
        EXPECT_EQ(failed.code, endOfData) << room;
        const Octets content = contentOf(buffer);
        ASSERT_EQ(content.size(), tMsgBuffer::capacity()) << room;
        EXPECT_EQ(behind(filled, content), first(room, before)) << room;
    }
}

TEST_F(MessageFieldsTest, FieldsAreReadInTheOrderOfTheirList) {
    tMsgBuffer buffer = received(next);
    readEachField(fields, buffer, status);
    EXPECT_EQ(fields.high, 0xAU);
    EXPECT_EQ(fields.low, 0xBU);
    EXPECT_EQ(fields.half, 0xDU);
    EXPECT_EQ(fields.signed8, -0x7F);
    EXPECT_EQ(fields.signed16, -0x7D7D);
    EXPECT_EQ(fields.unsigned32, 0x84858687U);
    EXPECT_EQ(fields.signed64, -0x7776757473727171);
    EXPECT_EQ(fields.inner.value, 0xF1F2U);
    EXPECT_EQ(status.code, 0);
}

TEST_F(MessageFieldsTest, SizeCountsEveryOctetOnTheWire) {
    EXPECT_EQ(sizeOfFields(fields), 21U);
    EXPECT_EQ(before.size(), 21U);
}

TEST_F(MessageFieldsTest, EachFieldAsItIsReadKeepsWhatWasThere) {
    tMsgBuffer buffer = received(first(12, next));
    readEachField(fields, buffer, status);
    EXPECT_EQ(status.code, endOfData);
    zeerr::LocalStatus clean;
    tMsgBuffer again;
    writeFields(fields, again, clean);
    EXPECT_EQ(contentOf(again), octets("AB 0D 0000 81 8283 84858687 18191A1B1C1D1E1F 3132"));
}

TEST_F(MessageFieldsTest, NoOctetLeavesBothHalvesOfAnOctet) {
    tMsgBuffer buffer;
    readEachField(fields, buffer, status);
    EXPECT_EQ(fields.high, 0x1U);
    EXPECT_EQ(fields.low, 0x2U);
    EXPECT_EQ(fields.half, 0x3U);
}

TEST_F(MessageFieldsTest, AllOrNothingChangesNothingWhereverTheDataEnds) {
    for (std::size_t length = 0; length < next.size(); ++length) {
        tMsgBuffer buffer = received(first(length, next));
        zeerr::LocalStatus failed;
        readAllOrNothing(fields, buffer, failed);
        EXPECT_EQ(failed.code, endOfData) << length;
        EXPECT_EQ(written(), before) << length;
    }
}

TEST_F(MessageFieldsTest, AllOrNothingTakesTheWhole) {
    tMsgBuffer buffer = received(next);
    readAllOrNothing(fields, buffer, status);
    EXPECT_EQ(written(), nextWithoutReserved);
}

TEST_F(MessageFieldsTest, NothingIsStoredOnceTheStatusHoldsAnError) {
    tMsgBuffer buffer = received(next);
    zeerr::LocalStatus failed;
    failed.code = -1;
    readEachField(fields, buffer, failed);
    readAllOrNothing(fields, buffer, failed);
    EXPECT_EQ(written(), before);
    EXPECT_EQ(buffer.readU8(status), 0xABU);
}

} // namespace
