#include "tPtp4lPortDataSetNpMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lPortDataSetNpMgmtTlv;

namespace {

TEST(Ptp4lPortDataSetNpMgmtTlvTest, FreshObjectCarriesItsIdAndLength) {
    const tPtp4lPortDataSetNpMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 10U);
    EXPECT_EQ(tlv.managementId(), 0xC002U);
    EXPECT_EQ(tlv.size(), 14U);
    EXPECT_EQ(serialized(tlv), octets("0001 000A C002 00000000 00000000"));
}

TEST(Ptp4lPortDataSetNpMgmtTlvTest, FieldsAreReadInWireOrder) {
    const Octets wire = octets("A1B2 C3D4 E5F6 81828384 95969798");
    const auto tlv = readFrom<tPtp4lPortDataSetNpMgmtTlv>(wire);
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.managementId(), 0xE5F6U);
    EXPECT_EQ(tlv.neighborPropDelayThresh(), 0x81828384U);
    EXPECT_EQ(tlv.asCapable(), -0x6A696868);
    EXPECT_EQ(tlv.size(), 14U);
    EXPECT_EQ(serialized(tlv), wire);
}

TEST(Ptp4lPortDataSetNpMgmtTlvTest, AnswerOfTheRealDaemonIsRead) {
    const Octets answer = octets("0001 000a c002 01312d00 00000001");
    const auto tlv = readFrom<tPtp4lPortDataSetNpMgmtTlv>(answer);
    EXPECT_EQ(tlv.neighborPropDelayThresh(), 20000000U);
    EXPECT_EQ(tlv.asCapable(), 1);
    EXPECT_EQ(serialized(tlv), answer);
}

} // namespace
