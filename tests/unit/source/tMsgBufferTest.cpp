#include "tMsgBuffer.h"

#include <algorithm>

#include <gtest/gtest.h>

#include "errors/Exception.h"
#include "support/Octets.h"

using zekelVantel::tMsgBuffer;

namespace {

constexpr char readPastEnd[] = R"({"error_constant":"zeoskerr_endOfData",)"
                               R"("file":"tMsgBuffer","line":73,"component":"vantel_bc"})";
constexpr char writePastEnd[] = R"({"error_constant":"zeoskerr_endOfData",)"
                                R"("file":"tMsgBuffer","line":102,"component":"vantel_bc"})";
constexpr char tooLong[] = R"({"error_constant":"zeoskerr_bufferTooSmall",)"
                           R"("file":"tMsgBuffer","line":60,"component":"vantel_bc"})";

class MsgBufferTest : public testing::Test {
protected:
    void writeOctets(unsigned count) {
        for (unsigned octet = 0; octet < count; ++octet) {
            buffer.writeU8(static_cast<std::uint8_t>(octet % 251 + 1), status);
        }
    }

    tMsgBuffer buffer;
    zeerr::LocalStatus status;
};

TEST_F(MsgBufferTest, FreshBufferIsEmptyAndZero) {
    EXPECT_EQ(buffer.getLength(), 0U);
    EXPECT_EQ(buffer.capacity(), 1500U);
    EXPECT_EQ(Octets(buffer.data(), buffer.data() + 1500), Octets(1500, 0));
}

TEST_F(MsgBufferTest, ReadingAnEmptyBufferGivesZeroAndEndOfData) {
    EXPECT_EQ(buffer.readU8(status), 0);
    EXPECT_EQ(status.code, -52012);
    EXPECT_STREQ(status.json, readPastEnd);
}

TEST_F(MsgBufferTest, SecondReadAfterEndOfDataChangesNothing) {
    buffer.readU8(status);
    const char* const text = status.json;
    EXPECT_EQ(buffer.readU8(status), 0);
    EXPECT_EQ(status.code, -52012);
    EXPECT_EQ(status.json, text);
    EXPECT_STREQ(status.json, readPastEnd);
    EXPECT_EQ(buffer.getLength(), 0U);
}

TEST_F(MsgBufferTest, EmptyBufferGivesZeroInEveryWidth) {
    EXPECT_EQ(buffer.readU16(status), 0U);
    zeerr::LocalStatus second;
    EXPECT_EQ(buffer.readU32(second), 0U);
    zeerr::LocalStatus third;
    EXPECT_EQ(buffer.readU64(third), 0U);
    EXPECT_EQ(status.code, -52012);
    EXPECT_EQ(second.code, -52012);
    EXPECT_EQ(third.code, -52012);
}

TEST_F(MsgBufferTest, ReadsEveryWidthWithTheHighOctetFirst) {
    buffer = received(octets("81 8234 83456789 0102030405060708"));
    EXPECT_EQ(buffer.readU8(status), 0x81U);
    EXPECT_EQ(buffer.readU16(status), 0x8234U);
    EXPECT_EQ(buffer.readU32(status), 0x83456789U);
    EXPECT_EQ(buffer.readU64(status), 0x0102030405060708U);
    EXPECT_EQ(status.code, 0);
    buffer.readU8(status);
    EXPECT_EQ(status.code, -52012);
}

TEST_F(MsgBufferTest, ReadsWidestValuesWhole) {
    buffer = received(octets("FF FFFE FFFFFFFD FFFFFFFFFFFFFFFC"));
    EXPECT_EQ(buffer.readU8(status), 0xFFU);
    EXPECT_EQ(buffer.readU16(status), 0xFFFEU);
    EXPECT_EQ(buffer.readU32(status), 0xFFFFFFFDU);
    EXPECT_EQ(buffer.readU64(status), 0xFFFFFFFFFFFFFFFCU);
}

TEST_F(MsgBufferTest, WritesEveryWidthWithTheHighOctetFirst) {
    buffer.writeU16(0x1234, status);
    buffer.writeU8(0x91, status);
    buffer.writeU32(0x92A3B4C5, status);
    buffer.writeU64(0xF1E2D3C4B5A69788, status);
    EXPECT_EQ(contentOf(buffer), octets("12 34 91 92A3B4C5 F1E2D3C4B5A69788"));
    EXPECT_EQ(status.code, 0);
}

TEST_F(MsgBufferTest, ValueCutByTheEndConsumesWhatWasThereAndIsZeroBehindIt) {
    const auto cut = [this](const char* datagram, auto read) -> std::uint64_t {
        buffer = received(octets(datagram));
        zeerr::LocalStatus first;
        const auto value = (buffer.*read)(first);
        EXPECT_EQ(first.code, -52012) << datagram;
        zeerr::LocalStatus second;
        EXPECT_EQ(buffer.readU8(second), 0U) << datagram;
        EXPECT_EQ(second.code, -52012) << datagram;
        return value;
    };
    EXPECT_EQ(cut("8A", &tMsgBuffer::readU16), 0x8A00U);
    EXPECT_EQ(cut("8A", &tMsgBuffer::readU32), 0x8A000000U);
    EXPECT_EQ(cut("8A 9B AC", &tMsgBuffer::readU32), 0x8A9BAC00U);
    EXPECT_EQ(cut("8A 9B AC", &tMsgBuffer::readU64), 0x8A9BAC0000000000U);
    EXPECT_EQ(cut("8A 9B AC BD CE DF E7", &tMsgBuffer::readU64), 0x8A9BACBDCEDFE700U);
}

TEST_F(MsgBufferTest, ReadingEndsAtTheLengthAndNotAtWhatLiesBehind) {
    buffer = received(octets("0A 0B 0C"));
    buffer.setLength(2, status);
    EXPECT_EQ(buffer.readU8(status), 0x0AU);
    EXPECT_EQ(buffer.readU8(status), 0x0BU);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(buffer.readU8(status), 0U);
    EXPECT_EQ(status.code, -52012);
}

TEST_F(MsgBufferTest, OctetBehindTheLastIsRefusedAndTheRestLands) {
    writeOctets(1500);
    ASSERT_EQ(status.code, 0);
    const Octets all = contentOf(buffer);
    buffer.writeU8(0xEE, status);
    EXPECT_EQ(status.code, -52012);
    EXPECT_STREQ(status.json, writePastEnd);
    EXPECT_EQ(buffer.getLength(), 1500U);
    EXPECT_EQ(contentOf(buffer), all);
    EXPECT_EQ(all[0], 1U);
    EXPECT_EQ(all[250], 251U);
    EXPECT_EQ(all[1499], 1499U % 251 + 1);
}

TEST_F(MsgBufferTest, ValueAcrossTheEndLandsAsFarAsThereIsRoom) {
    writeOctets(1498);
    buffer.writeU32(0xC1C2C3C4, status);
    EXPECT_EQ(status.code, -52012);
    EXPECT_EQ(buffer.getLength(), 1500U);
    EXPECT_EQ(behind(1498, contentOf(buffer)), octets("C1 C2"));
}

TEST_F(MsgBufferTest, LengthOfTheCapacityIsAccepted) {
    buffer.setLength(1500, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(buffer.getLength(), 1500U);
}

TEST_F(MsgBufferTest, LengthBeyondTheCapacityIsRefused) {
    buffer.setLength(7, status);
    buffer.setLength(1501, status);
    EXPECT_EQ(status.code, -52019);
    EXPECT_STREQ(status.json, tooLong);
    EXPECT_EQ(buffer.getLength(), 7U);
}

TEST_F(MsgBufferTest, LargestLengthIsRefused) {
    buffer.setLength(0xFFFFFFFF, status);
    EXPECT_EQ(status.code, -52019);
    EXPECT_EQ(buffer.getLength(), 0U);
}

TEST_F(MsgBufferTest, WritingGoesOnBehindTheLengthThatWasSet) {
    buffer.setLength(3, status);
    buffer.writeU8(0xAB, status);
    EXPECT_EQ(buffer.getLength(), 4U);
    EXPECT_EQ(contentOf(buffer), octets("00 00 00 AB"));
}

TEST_F(MsgBufferTest, ShorterLengthTakesTheWritePositionBack) {
    buffer.writeU32(0x01020304, status);
    buffer.setLength(1, status);
    buffer.writeU8(0xAB, status);
    EXPECT_EQ(contentOf(buffer), octets("01 AB"));
    EXPECT_EQ(buffer.data()[2], 0x03U);
}

TEST_F(MsgBufferTest, SettingTheLengthLeavesTheReadPosition) {
    buffer.writeU32(0x01020304, status);
    EXPECT_EQ(buffer.readU16(status), 0x0102U);
    buffer.setLength(3, status);
    EXPECT_EQ(buffer.readU8(status), 0x03U);
    buffer.setLength(1, status);
    buffer.readU8(status);
    EXPECT_EQ(status.code, -52012);
}

TEST_F(MsgBufferTest, ReadingBehindALengthThatShrankIsEndOfData) {
    buffer.writeU64(0x0102030405060708, status);
    EXPECT_EQ(buffer.readU16(status), 0x0102U);
    buffer.setLength(1, status);
    buffer.readU32(status);
    EXPECT_EQ(status.code, -52012);
}

TEST_F(MsgBufferTest, SkippingReadsAndKeepsNothing) {
    buffer.writeU32(0x01020304, status);
    buffer.skip(3, status);
    EXPECT_EQ(buffer.readU8(status), 0x04U);
    EXPECT_EQ(status.code, 0);
    buffer.skip(0, status);
    EXPECT_EQ(status.code, 0);
}

TEST_F(MsgBufferTest, SkippingPastTheEndConsumesWhatThereIs) {
    buffer.writeU16(0x0A0B, status);
    buffer.skip(3, status);
    EXPECT_EQ(status.code, -52012);
    zeerr::LocalStatus fresh;
    EXPECT_EQ(buffer.readU8(fresh), 0U);
    EXPECT_EQ(fresh.code, -52012);
}

TEST_F(MsgBufferTest, ReadingAndWritingKeepPositionsOfTheirOwn) {
    buffer.writeU16(0x0A0B, status);
    EXPECT_EQ(buffer.readU8(status), 0x0AU);
    buffer.writeU8(0x0C, status);
    EXPECT_EQ(buffer.readU8(status), 0x0BU);
    EXPECT_EQ(buffer.readU8(status), 0x0CU);
    EXPECT_EQ(contentOf(buffer), octets("0A 0B 0C"));
    EXPECT_EQ(status.code, 0);
}

TEST_F(MsgBufferTest, RawAccessLeavesLengthAndPositions) {
    buffer.writeU16(0x0A0B, status);
    buffer.data()[0] = 0x77;
    buffer.data()[2] = 0x79;
    EXPECT_EQ(buffer.getLength(), 2U);
    EXPECT_EQ(buffer.readU16(status), 0x770BU);
    buffer.writeU8(0x78, status);
    EXPECT_EQ(contentOf(buffer), octets("77 0B 78"));
}

TEST_F(MsgBufferTest, ClearZeroesOctetsLengthAndPositions) {
    writeOctets(1500);
    buffer.readU64(status);
    buffer.clear();
    EXPECT_EQ(buffer.getLength(), 0U);
    EXPECT_EQ(Octets(buffer.data(), buffer.data() + 1500), Octets(1500, 0));
    buffer.writeU8(0x5A, status);
    EXPECT_EQ(contentOf(buffer), octets("5A"));
    EXPECT_EQ(buffer.readU8(status), 0x5AU);
    EXPECT_EQ(status.code, 0);
}

TEST_F(MsgBufferTest, ClearZeroesWhatWasWrittenThroughThePointer) {
    buffer.data()[1499] = 0xAB;
    buffer.clear();
    EXPECT_EQ(Octets(buffer.data(), buffer.data() + 1500), Octets(1500, 0));
}

TEST_F(MsgBufferTest, ClearZeroesWhatAShorterLengthLeftBehind) {
    writeOctets(100);
    buffer.setLength(2, status);
    buffer.clear();
    EXPECT_EQ(Octets(buffer.data(), buffer.data() + 1500), Octets(1500, 0));
}

TEST_F(MsgBufferTest, ClearZeroesADatagramOfAnyLength) {
    for (const std::uint32_t length : {1U, 104U, 1500U}) {
        const auto receive = [=](std::uint8_t* octets, std::uint32_t capacity) {
            EXPECT_EQ(capacity, 1500U);
            std::fill_n(octets, length, std::uint8_t{0xAB});
            return static_cast<std::int64_t>(length);
        };
        EXPECT_EQ(buffer.fill(receive, status), length);
        EXPECT_EQ(contentOf(buffer), Octets(length, 0xAB));
        buffer.clear();
        EXPECT_EQ(Octets(buffer.data(), buffer.data() + 1500), Octets(1500, 0));
    }
}

TEST_F(MsgBufferTest, ADatagramThatDidNotComeChangesNothing) {
    writeOctets(3);
    EXPECT_EQ(buffer.fill([](auto&&...) { return -1; }, status), -1);
    EXPECT_EQ(contentOf(buffer), octets("01 02 03"));
    EXPECT_EQ(status.code, 0);
}

TEST_F(MsgBufferTest, OctetsAreTakenAtOnceOrNotAtAll) {
    writeOctets(5);
    const std::uint8_t* const taken = buffer.take(3, status);
    ASSERT_NE(taken, nullptr);
    EXPECT_EQ(Octets(taken, taken + 3), octets("01 02 03"));
    EXPECT_EQ(buffer.take(3, status), nullptr);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(buffer.readU16(status), 0x0405U);
    EXPECT_NE(buffer.take(0, status), nullptr);
    status.code = -1;
    EXPECT_EQ(buffer.take(0, status), nullptr);
}

TEST_F(MsgBufferTest, OctetsAreAppendedAtOnceOrNotAtAll) {
    writeOctets(1498);
    std::uint8_t* const appended = buffer.append(1, status);
    ASSERT_NE(appended, nullptr);
    *appended = 0xAB;
    EXPECT_EQ(buffer.append(2, status), nullptr);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(behind(1498, contentOf(buffer)), octets("AB"));
    EXPECT_EQ(buffer.append(1, status), appended + 1);
    EXPECT_EQ(buffer.getLength(), 1500U);
    status.code = -1;
    EXPECT_EQ(buffer.append(0, status), nullptr);
    EXPECT_EQ(buffer.getLength(), 1500U);
}

TEST_F(MsgBufferTest, ErrorMakesEveryOperationDoNothing) {
    buffer.writeU16(0x0A0B, status);
    zeerr::LocalStatus failed;
    failed.code = -1;
    EXPECT_EQ(buffer.readU8(failed), 0U);
    EXPECT_EQ(buffer.readU16(failed), 0U);
    EXPECT_EQ(buffer.readU32(failed), 0U);
    EXPECT_EQ(buffer.readU64(failed), 0U);
    buffer.writeU8(0xF1, failed);
    buffer.writeU16(0xF2F3, failed);
    buffer.writeU32(0xF4F5F6F7, failed);
    buffer.writeU64(0xF1F2F3F4F5F6F7F8, failed);
    buffer.setLength(1, failed);
    buffer.setLength(1501, failed);
    EXPECT_EQ(failed.code, -1);
    EXPECT_EQ(failed.json, nullptr);
    EXPECT_EQ(contentOf(buffer), octets("0A 0B"));
    EXPECT_EQ(buffer.data()[2], 0U);
    EXPECT_EQ(buffer.readU16(status), 0x0A0BU);
}

TEST_F(MsgBufferTest, WarningStopsNothing) {
    status.code = 1;
    buffer.writeU16(0x0A0B, status);
    EXPECT_EQ(buffer.readU8(status), 0x0AU);
    buffer.setLength(1, status);
    EXPECT_EQ(buffer.getLength(), 1U);
    EXPECT_EQ(status.code, 1);
    EXPECT_EQ(status.json, nullptr);
}

TEST_F(MsgBufferTest, FailureReplacesAWarning) {
    status.code = 1;
    buffer.readU8(status);
    EXPECT_EQ(status.code, -52012);
    EXPECT_STREQ(status.json, readPastEnd);
}

} // namespace
