#include "tPtpMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpMgmtTlv;

namespace {

TEST(PtpMgmtTlvTest, FreshHeadHasNoManagementId) {
    const tPtpMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 0U);
    EXPECT_EQ(tlv.managementId(), 0U);
    EXPECT_EQ(tlv.size(), 6U);
    EXPECT_EQ(serialized(tlv), octets("0001 0000 0000"));
}

TEST(PtpMgmtTlvTest, FieldsAreReadInWireOrder) {
    const auto tlv = readFrom<tPtpMgmtTlv>(octets("A1B2 C3D4 E5F6"));
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.managementId(), 0xE5F6U);
    EXPECT_EQ(tlv.size(), 6U);
    EXPECT_EQ(serialized(tlv), octets("A1B2 C3D4 E5F6"));
}

TEST(PtpMgmtTlvTest, HeadCutAnywhereKeepsWhatWasReadBefore) {
    expectEachFieldAsItIsRead<tPtpMgmtTlv>(octets("0102 0304 0506"), octets("F1F2 F3F4 F5F6"),
                                           {2, 4, 6});
}

TEST(PtpMgmtTlvTest, ReadsItsSizeAndNoMore) {
    EXPECT_EQ(octetsConsumed<tPtpMgmtTlv>(Octets(9, 0x42)), 6U);
}

TEST(PtpMgmtTlvTest, OnlyAnErrorStopsReading) {
    expectOnlyAnErrorStopsReading<tPtpMgmtTlv>(octets("0102 0304 0506"), octets("F1F2 F3F4 F5F6"));
}

} // namespace
