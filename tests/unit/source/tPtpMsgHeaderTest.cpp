#include "tPtpMsgHeader.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpClockIdentity;
using zekelVantel::tPtpMsgHeader;
using zekelVantel::tPtpPortIdentity;

namespace tPtpMsgHeaderTest {

const Octets fresh = octets("0D 02 0022 00 00 0000 0000000000000000 00000000"
                            "0000000000000000 0000 0000 04 00");
const Octets before = octets("12 03 0405 06 00 0000 0708090A0B0C0D0E 00000000"
                             "1112131415161718 191A 1B1C 1D 1E");
const Octets next = octets("5B 07 8142 A3 00 0000 91A2B3C4D5E6F708 00000000"
                           "C0C1C2C3C4C5C6C7 D8E9 FAAB B7 86");

TEST(PtpMsgHeaderTest, FreshHeaderIsAManagementMessageOfVersionTwo) {
    const tPtpMsgHeader header;
    EXPECT_EQ(serialized(header), fresh);
    EXPECT_EQ(header.size(), 34U);
}

TEST(PtpMsgHeaderTest, FreshHeaderGivesItsDefaults) {
    const tPtpMsgHeader header;
    EXPECT_EQ(header.transportSpecific(), 0U);
    EXPECT_EQ(header.messageType(), 13U);
    EXPECT_EQ(header.versionPtp(), 2U);
    EXPECT_EQ(header.messageLength(), 34U);
    EXPECT_EQ(header.domainNumber(), 0U);
    EXPECT_EQ(header.correctionField(), 0);
    EXPECT_EQ(serialized(header.sourcePortIdentity()), Octets(10, 0));
    EXPECT_EQ(header.sequenceId(), 0U);
    EXPECT_EQ(header.controlField(), 4U);
    EXPECT_EQ(header.logMessageInterval(), 0);
}

TEST(PtpMsgHeaderTest, FieldsAreReadInWireOrder) {
    const auto header = readFrom<tPtpMsgHeader>(next);
    EXPECT_EQ(header.transportSpecific(), 0x5U);
    EXPECT_EQ(header.messageType(), 0xBU);
    EXPECT_EQ(header.versionPtp(), 0x7U);
    EXPECT_EQ(header.messageLength(), 0x8142U);
    EXPECT_EQ(header.domainNumber(), 0xA3U);
    EXPECT_EQ(header.correctionField(), -0x6E5D4C3B2A1908F8);
    EXPECT_EQ(serialized(header.sourcePortIdentity().clockIdentity()), octets("C0C1C2C3C4C5C6C7"));
    EXPECT_EQ(header.sourcePortIdentity().portNumber(), 0xD8E9U);
    EXPECT_EQ(header.sequenceId(), 0xFAABU);
    EXPECT_EQ(header.controlField(), 0xB7U);
    EXPECT_EQ(header.logMessageInterval(), -122);
    EXPECT_EQ(serialized(header), next);
    EXPECT_EQ(header.size(), 34U);
}

TEST(PtpMsgHeaderTest, FirstOctetHoldsTransportSpecificAboveTheType) {
    Octets wire = fresh;
    wire[0] = 0x1D;
    const auto header = readFrom<tPtpMsgHeader>(wire);
    EXPECT_EQ(header.transportSpecific(), 1U);
    EXPECT_EQ(header.messageType(), 13U);
    EXPECT_EQ(serialized(header), wire);
}

TEST(PtpMsgHeaderTest, HighHalfOfTheVersionIsDropped) {
    Octets wire = fresh;
    wire[1] = 0x12;
    const auto header = readFrom<tPtpMsgHeader>(wire);
    EXPECT_EQ(header.versionPtp(), 2U);
    EXPECT_EQ(serialized(header), fresh);
}

TEST(PtpMsgHeaderTest, FlagsAndReservedOctetsAreConsumedAndDropped) {
    const Octets wire = octets("5B 37 8142 A3 FE FDFC 91A2B3C4D5E6F708 FBFAF9F8"
                               "C0C1C2C3C4C5C6C7 D8E9 FAAB B7 86");
    EXPECT_EQ(serialized(readFrom<tPtpMsgHeader>(wire)), next);
}

TEST(PtpMsgHeaderTest, SettersKeepTheLowFourBitsOfHalfOctets) {
    tPtpMsgHeader header;
    header.setTransportSpecific(0xA5);
    header.setMessageType(0xB6);
    header.setVersionPtp(0xC7);
    EXPECT_EQ(header.transportSpecific(), 0x5U);
    EXPECT_EQ(header.messageType(), 0x6U);
    EXPECT_EQ(header.versionPtp(), 0x7U);
    EXPECT_EQ(first(4, serialized(header)), octets("56 07 0022"));
}

TEST(PtpMsgHeaderTest, EachSetterChangesItsFieldAlone) {
    auto header = readFrom<tPtpMsgHeader>(before);
    header.setMessageLength(0x8182);
    header.setCorrectionField(-0x7E7D7C7B7A797878);
    header.setSequenceId(0xA1A2);
    header.setLogMessageInterval(-3);
    EXPECT_EQ(serialized(header), octets("12 03 8182 06 00 0000 8182838485868788 00000000"
                                         "1112131415161718 191A A1A2 1D FD"));
    header = readFrom<tPtpMsgHeader>(before);
    header.setDomainNumber(0x83);
    header.setSourcePortIdentity(tPtpPortIdentity(tPtpClockIdentity(0x9192939495969798), 0x999A));
    header.setControlField(0xB1);
    EXPECT_EQ(serialized(header), octets("12 03 0405 83 00 0000 0708090A0B0C0D0E 00000000"
                                         "9192939495969798 999A 1B1C B1 1E"));
    header = readFrom<tPtpMsgHeader>(before);
    header.setTransportSpecific(0x0C);
    EXPECT_EQ(serialized(header)[0], 0xC2U);
    header.setMessageType(0x0D);
    EXPECT_EQ(serialized(header)[0], 0xCDU);
    header.setVersionPtp(0x0E);
    EXPECT_EQ(behind(1, serialized(header)), octets("0E") + behind(2, before));
}

} // namespace tPtpMsgHeaderTest
