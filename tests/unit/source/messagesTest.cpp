#include <cstring>
#include <memory>
#include <ostream>

#include <gtest/gtest.h>

#include "support/Octets.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtMsg.h"

using namespace zekelVantel;

namespace messagesTest {

/// A kind of message, and two of it that differ.
struct Row {
    const char* name;
    std::unique_ptr<iMsgSerializable> (*make)();
    const char* before;
    const char* next;
    std::vector<std::size_t> ends; ///< of the fields; what is stored all or not at all is one

    friend void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }
};

template <typename Message>
std::unique_ptr<iMsgSerializable> make() {
    return std::make_unique<Message>();
}

class MessageTest : public testing::TestWithParam<Row> {
protected:
    const Octets before = octets(GetParam().before);
    const Octets next = octets(GetParam().next);
    const std::vector<std::size_t> ends = GetParam().ends;
    const std::unique_ptr<iMsgSerializable> message = GetParam().make();
};

TEST_P(MessageTest, WholeReplacesTheFormer) {
    EXPECT_EQ(readInto(*message, before), 0);
    EXPECT_EQ(readInto(*message, next), 0);
    EXPECT_EQ(serialized(*message), next);
}

TEST_P(MessageTest, WritesEveryOctetAlsoThoseThatAreReserved) {
    EXPECT_EQ(readInto(*message, next), 0);
    tMsgBuffer buffer;
    zeerr::LocalStatus status;
    std::memset(buffer.data(), 0x42, 1500);
    message->serialize(buffer, status);
    EXPECT_EQ(contentOf(buffer), next);
}

TEST_P(MessageTest, CutAnywhereKeepsEachFieldThatIsNotWhole) {
    expectEachFieldAsItIsRead(*message, before, first(ends.back(), next), ends);
}

TEST_P(MessageTest, ReadsItsSizeAndNoMore) {
    EXPECT_EQ(octetsConsumed(*message, next + Octets(5, 0x42)), ends.back());
}

TEST_P(MessageTest, OnlyAnErrorStopsReading) {
    for (const std::int32_t code : {-1, 1}) {
        EXPECT_EQ(readInto(*message, before), 0);
        tMsgBuffer buffer = received(next);
        zeerr::LocalStatus status;
        status.code = code;
        message->deserialize(buffer, status);
        EXPECT_EQ(status.code, code);
        EXPECT_EQ(serialized(*message), code < 0 ? before : next) << code;
    }
}

TEST_P(MessageTest, WritesTheOctetsThatHaveRoomUntilEndOfData) {
    EXPECT_EQ(readInto(*message, next), 0);
    for (std::size_t room = 0; room < next.size(); ++room) {
        tMsgBuffer buffer;
        zeerr::LocalStatus status;
        buffer.setLength(1500U - static_cast<std::uint32_t>(room), status);
        std::memset(buffer.data(), 0x42, 1500);
        message->serialize(buffer, status);
        EXPECT_EQ(status.code, endOfData);
        EXPECT_EQ(buffer.getLength(), 1500U);
        EXPECT_EQ(Octets(buffer.data() + 1500 - room, buffer.data() + 1500), first(room, next))
            << room;
    }
}

const Row allOrNothing[] = {
    {"ClockIdentity", make<tPtpClockIdentity>, "0102030405060708", "F1F2F3F4F5F6F7F8", {8}},
    {"ClockQuality", make<tPtpClockQuality>, "01 02 0304", "F1 F2 F3F4", {4}},
    {"PortIdentity",
     make<tPtpPortIdentity>,
     "0102030405060708 090A",
     "F1F2F3F4F5F6F7F8 F9FA",
     {10}},
    {"ScaledNs96",
     make<tPtpScaledNs96>,
     "0102 030405060708090A 0B0C",
     "F1F2 F3F4F5F6F7F8F9FA FBFC",
     {12}},
    {"Text", make<tPtpText>, "02 6869", "01 78", {2}},
};

const Row fieldByField[] = {
    {"MsgHeader",
     make<tPtpMsgHeader>,
     "12 03 0405 06 00 0000 0708090A0B0C0D0E 00000000 1112131415161718 191A 1B1C 1D 1E",
     "5B 07 8142 A3 00 0000 91A2B3C4D5E6F708 00000000 C0C1C2C3C4C5C6C7 D8E9 FAAB B7 86",
     {1, 2, 4, 5, 6, 8, 16, 20, 30, 32, 33, 34}},
    {"MgmtMsg",
     make<tPtpMgmtMsg>,
     "12 03 0405 06 00 0000 0708090A0B0C0D0E 00000000 1112131415161718 191A 1B1C 1D 1E"
     "2122232425262728 292A 2B 2C 2D 00",
     "5B 07 8142 A3 00 0000 91A2B3C4D5E6F708 00000000 C0C1C2C3C4C5C6C7 D8E9 FAAB B7 86"
     "E1E2E3E4E5E6E7E8 F9FA 9B AC BD 00",
     {1, 2, 4, 5, 6, 8, 16, 20, 30, 32, 33, 34, 44, 45, 46, 47, 48}},
    {"Tlv", make<tPtpTlv>, "0102 0304", "F1F2 F3F4", {2, 4}},
    {"MgmtTlv", make<tPtpMgmtTlv>, "0102 0304 0506", "F1F2 F3F4 F5F6", {2, 4, 6}},
    {"TimeStatus",
     make<tPtp4lTimeStatusMgmtTlv>,
     "0102 0304 0506 0708090A0B0C0D0E 1112131415161718 191A1B1C 1D1E1F20 2122"
     "2324 25262728292A2B2C 2D2E 2F303132 3334353637383940",
     "A1B2 C3D4 E5F6 8182838485868788 7192939495969798 A9AAABAC BDBEBFC0 D1D2"
     "6364 E5E6E7E8E9EAEBEC EDEE F1F2F3F4 91939597999B9D9F",
     {2, 4, 6, 14, 22, 26, 30, 32, 44, 48, 56}},
};

const Row allOrNothingBehindTheHead[] = {
    {"DefaultDataSet",
     make<tPtp4lDefaultDataSetMgmtTlv>,
     "0102 0304 0506 07 08 090A 0B 0C 0D 0E0F 10 1112131415161718 19 1A",
     "A1B2 C3D4 E5F6 81 92 A3A4 B5 C6 D7 E8E9 FA 8B8D8F9193959799 AC BD",
     {2, 4, 6, 26}},
    {"ParentDataSet",
     make<tPtp4lParentDataSetMgmtTlv>,
     "0102 0304 0506 0708090A0B0C0D0E 0F10 11 12 1314 15161718 19"
     "1A 1B 1C1D 1E 1F20212223242526",
     "A1B2 C3D4 E5F6 8182838485868788 898A 9B AC BDBE CFD0D1D2 E3"
     "F4 85 9697 A8 B1B3B5B7B9BBBDBF",
     {2, 4, 6, 38}},
    {"PortDataSet",
     make<tPtp4lPortDataSetMgmtTlv>,
     "0102 0304 0506 0708090A0B0C0D0E 0F10 11 12 131415161718191A 1B 1C 1D 1E 1F 20",
     "A1B2 C3D4 E5F6 8182838485868788 898A 9B AC BDBEBFC0C1C2C3C4 D5 E6 F7 88 99 AA",
     {2, 4, 6, 32}},
    {"PortDataSetNp",
     make<tPtp4lPortDataSetNpMgmtTlv>,
     "0102 0304 0506 0708090A 0B0C0D0E",
     "A1B2 C3D4 E5F6 81828384 95969798",
     {2, 4, 6, 14}},
    {"PortPropertiesWithAPadOctet",
     make<tPtp4lPortPropertiesMgmtTlv>,
     "0001 0014 C004 8182838485868788 898A 9B AC 05 73796E6337",
     "0001 0014 C004 0102030405060708 090A 0B 0C 04 65746830 00",
     {2, 4, 6, 23}},
    {"PortPropertiesWithoutAPadOctet",
     make<tPtp4lPortPropertiesMgmtTlv>,
     "0001 0014 C004 0102030405060708 090A 0B 0C 04 65746830 00",
     "0001 0014 C004 8182838485868788 898A 9B AC 05 73796E6337",
     {2, 4, 6, 24}},
};

const auto nameOf = [](const auto& row) { return row.param.name; };

INSTANTIATE_TEST_SUITE_P(AllOrNothing, MessageTest, testing::ValuesIn(allOrNothing), nameOf);
INSTANTIATE_TEST_SUITE_P(FieldByField, MessageTest, testing::ValuesIn(fieldByField), nameOf);
INSTANTIATE_TEST_SUITE_P(AllOrNothingBehindTheHead, MessageTest,
                         testing::ValuesIn(allOrNothingBehindTheHead), nameOf);

} // namespace messagesTest
