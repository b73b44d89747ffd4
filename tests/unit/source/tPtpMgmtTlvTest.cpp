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

} // namespace
