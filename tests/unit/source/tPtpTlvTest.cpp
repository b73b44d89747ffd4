#include "tPtpTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpTlv;

namespace {

TEST(PtpTlvTest, FreshHeadIsOfManagement) {
    const tPtpTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 0U);
    EXPECT_EQ(tlv.size(), 4U);
    EXPECT_EQ(serialized(tlv), octets("0001 0000"));
}

TEST(PtpTlvTest, FieldsAreReadInWireOrder) {
    const auto tlv = readFrom<tPtpTlv>(octets("A1B2 C3D4"));
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.size(), 4U);
    EXPECT_EQ(serialized(tlv), octets("A1B2 C3D4"));
}

} // namespace
