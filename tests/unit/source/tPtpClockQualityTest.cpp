#include "tPtpClockQuality.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpClockQuality;

namespace {

TEST(PtpClockQualityTest, IsZeroByDefault) {
    const tPtpClockQuality quality;
    EXPECT_EQ(quality.clockClass(), 0U);
    EXPECT_EQ(quality.clockAccuracy(), 0U);
    EXPECT_EQ(quality.offsetScaledLogVariance(), 0U);
    EXPECT_EQ(quality.size(), 4U);
    EXPECT_EQ(serialized(quality), Octets(4, 0));
}

TEST(PtpClockQualityTest, FieldsAreReadInWireOrder) {
    const auto quality = readFrom<tPtpClockQuality>(octets("F8 21 B36A"));
    EXPECT_EQ(quality.clockClass(), 0xF8U);
    EXPECT_EQ(quality.clockAccuracy(), 0x21U);
    EXPECT_EQ(quality.offsetScaledLogVariance(), 0xB36AU);
    EXPECT_EQ(serialized(quality), octets("F8 21 B36A"));
}

} // namespace
