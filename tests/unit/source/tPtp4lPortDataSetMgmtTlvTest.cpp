#include "tPtp4lPortDataSetMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lPortDataSetMgmtTlv;

namespace {

TEST(Ptp4lPortDataSetMgmtTlvTest, FreshObjectCarriesItsIdAndLength) {
    const tPtp4lPortDataSetMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 28U);
    EXPECT_EQ(tlv.managementId(), 0x2004U);
    EXPECT_EQ(tlv.size(), 32U);
    EXPECT_EQ(serialized(tlv), octets("0001 001C 2004 0000000000000000 0000 03") + Octets(15, 0));
}

TEST(Ptp4lPortDataSetMgmtTlvTest, FieldsAreReadInWireOrder) {
    const Octets wire =
        octets("A1B2 C3D4 E5F6 8182838485868788 898A 9B AC BDBEBFC0C1C2C3C4 D5 E6 F7 88 99 AA");
    const auto tlv = readFrom<tPtp4lPortDataSetMgmtTlv>(wire);
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.managementId(), 0xE5F6U);
    EXPECT_EQ(serialized(tlv.portIdentity().clockIdentity()), octets("8182838485868788"));
    EXPECT_EQ(tlv.portIdentity().portNumber(), 0x898AU);
    EXPECT_EQ(tlv.portState(), 0x9BU);
    EXPECT_EQ(tlv.logMinDelayReqInterval(), -0x54);
    EXPECT_EQ(tlv.peerMeanPathDelay(), -0x4241403F3E3D3C3C);
    EXPECT_EQ(tlv.logAnnounceInterval(), -0x2B);
    EXPECT_EQ(tlv.announceReceiptTimeout(), 0xE6U);
    EXPECT_EQ(tlv.logSyncInterval(), -0x09);
    EXPECT_EQ(tlv.delayMechanism(), 0x88U);
    EXPECT_EQ(tlv.logMinPdelayReqInterval(), -0x67);
    EXPECT_EQ(tlv.versionNumber(), 0xAAU);
    EXPECT_EQ(tlv.size(), 32U);
    EXPECT_EQ(serialized(tlv), wire);
}

TEST(Ptp4lPortDataSetMgmtTlvTest, AnswerOfTheRealDaemonIsRead) {
    const Octets answer =
        octets("0001 001c 2004 a20f5efffe5b6683 0001 08 00 0000000000000000 fe 03 fd 01 00 02");
    const auto tlv = readFrom<tPtp4lPortDataSetMgmtTlv>(answer);
    EXPECT_EQ(tlv.portIdentity().portNumber(), 1U);
    EXPECT_EQ(tlv.portState(), 8U);
    EXPECT_EQ(tlv.logAnnounceInterval(), -2);
    EXPECT_EQ(tlv.announceReceiptTimeout(), 3U);
    EXPECT_EQ(tlv.logSyncInterval(), -3);
    EXPECT_EQ(tlv.delayMechanism(), 1U);
    EXPECT_EQ(tlv.versionNumber(), 2U);
    EXPECT_EQ(serialized(tlv), answer);
}

} // namespace
