#include "tPtp4lParentDataSetMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lParentDataSetMgmtTlv;

namespace {

TEST(Ptp4lParentDataSetMgmtTlvTest, FreshObjectCarriesItsIdAndLength) {
    const tPtp4lParentDataSetMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 34U);
    EXPECT_EQ(tlv.managementId(), 0x2002U);
    EXPECT_EQ(tlv.size(), 38U);
    EXPECT_EQ(serialized(tlv), octets("0001 0022 2002") + Octets(32, 0));
}

TEST(Ptp4lParentDataSetMgmtTlvTest, FieldsAreReadInWireOrder) {
    const Octets wire = octets("A1B2 C3D4 E5F6 8182838485868788 898A 9B AC BDBE CFD0D1D2 E3"
                               "F4 85 9697 A8 B1B3B5B7B9BBBDBF");
    const auto tlv = readFrom<tPtp4lParentDataSetMgmtTlv>(wire);
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.managementId(), 0xE5F6U);
    EXPECT_EQ(serialized(tlv.parentPortIdentity().clockIdentity()), octets("8182838485868788"));
    EXPECT_EQ(tlv.parentPortIdentity().portNumber(), 0x898AU);
    EXPECT_EQ(tlv.parentStats(), 0x9BU);
    EXPECT_EQ(tlv.reserved(), 0xACU);
    EXPECT_EQ(tlv.observedParentOffsetScaledLogVariance(), 0xBDBEU);
    EXPECT_EQ(tlv.observedParentClockPhaseChangeRate(), -0x302F2E2E);
    EXPECT_EQ(tlv.grandmasterPriority1(), 0xE3U);
    EXPECT_EQ(tlv.grandmasterClockQuality().clockClass(), 0xF4U);
    EXPECT_EQ(tlv.grandmasterClockQuality().clockAccuracy(), 0x85U);
    EXPECT_EQ(tlv.grandmasterClockQuality().offsetScaledLogVariance(), 0x9697U);
    EXPECT_EQ(tlv.grandmasterPriority2(), 0xA8U);
    EXPECT_EQ(serialized(tlv.grandmasterIdentity()), octets("B1B3B5B7B9BBBDBF"));
    EXPECT_EQ(tlv.size(), 38U);
    EXPECT_EQ(serialized(tlv), wire);
}

TEST(Ptp4lParentDataSetMgmtTlvTest, ReservedOctetIsKeptAndWrittenBack) {
    Octets wire = octets("0001 0022 2002") + Octets(32, 0);
    wire[6 + 11] = 0x5A;
    const auto tlv = readFrom<tPtp4lParentDataSetMgmtTlv>(wire);
    EXPECT_EQ(tlv.reserved(), 0x5AU);
    EXPECT_EQ(serialized(tlv), wire);
}

TEST(Ptp4lParentDataSetMgmtTlvTest, AnswerOfTheRealDaemonIsRead) {
    const Octets answer = octets("0001 0022 2002 a65c12fffe175c7d 0001 00 00 ffff 7fffffff 07"
                                 "06 fe ffff 80 a65c12fffe175c7d");
    const auto tlv = readFrom<tPtp4lParentDataSetMgmtTlv>(answer);
    EXPECT_EQ(tlv.parentPortIdentity().portNumber(), 1U);
    EXPECT_EQ(tlv.observedParentClockPhaseChangeRate(), 0x7FFFFFFF);
    EXPECT_EQ(tlv.grandmasterPriority1(), 7U);
    EXPECT_EQ(tlv.grandmasterClockQuality().clockClass(), 6U);
    EXPECT_EQ(tlv.grandmasterPriority2(), 128U);
    EXPECT_EQ(serialized(tlv), answer);
}

} // namespace
