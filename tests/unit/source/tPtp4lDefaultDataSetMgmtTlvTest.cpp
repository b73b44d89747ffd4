#include "tPtp4lDefaultDataSetMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lDefaultDataSetMgmtTlv;

namespace {

TEST(Ptp4lDefaultDataSetMgmtTlvTest, FreshObjectCarriesItsIdAndLength) {
    const tPtp4lDefaultDataSetMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 22U);
    EXPECT_EQ(tlv.managementId(), 0x2000U);
    EXPECT_EQ(tlv.size(), 26U);
    EXPECT_EQ(serialized(tlv), octets("0001 0016 2000") + Octets(20, 0));
}

TEST(Ptp4lDefaultDataSetMgmtTlvTest, FieldsAreReadInWireOrder) {
    const Octets wire = octets("A1B2 C3D4 E5F6 81 92 A3A4 B5 C6 D7 E8E9 FA 8B8D8F9193959799 AC BD");
    const auto tlv = readFrom<tPtp4lDefaultDataSetMgmtTlv>(wire);
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.managementId(), 0xE5F6U);
    EXPECT_EQ(tlv.flags(), 0x81U);
    EXPECT_EQ(tlv.reserved1(), 0x92U);
    EXPECT_EQ(tlv.numberPorts(), 0xA3A4U);
    EXPECT_EQ(tlv.priority1(), 0xB5U);
    EXPECT_EQ(tlv.clockQuality().clockClass(), 0xC6U);
    EXPECT_EQ(tlv.clockQuality().clockAccuracy(), 0xD7U);
    EXPECT_EQ(tlv.clockQuality().offsetScaledLogVariance(), 0xE8E9U);
    EXPECT_EQ(tlv.priority2(), 0xFAU);
    EXPECT_EQ(serialized(tlv.clockIdentity()), octets("8B8D8F9193959799"));
    EXPECT_EQ(tlv.domainNumber(), 0xACU);
    EXPECT_EQ(tlv.reserved2(), 0xBDU);
    EXPECT_EQ(tlv.size(), 26U);
    EXPECT_EQ(serialized(tlv), wire);
}

TEST(Ptp4lDefaultDataSetMgmtTlvTest, AnswerOfTheRealDaemonIsRead) {
    const Octets answer =
        octets("0001 0016 2000 03 00 0001 80 ff fe ffff 80 a20f5efffe5b6683 00 00");
    const auto tlv = readFrom<tPtp4lDefaultDataSetMgmtTlv>(answer);
    EXPECT_EQ(tlv.flags(), 3U);
    EXPECT_EQ(tlv.numberPorts(), 1U);
    EXPECT_EQ(tlv.priority1(), 128U);
    EXPECT_EQ(tlv.clockQuality().clockClass(), 255U);
    EXPECT_EQ(serialized(tlv.clockIdentity()), octets("a20f5efffe5b6683"));
    EXPECT_EQ(serialized(tlv), answer);
}

} // namespace
