#include "tPtpScaledNs96.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpScaledNs96;

namespace {

TEST(PtpScaledNs96Test, IsZeroByDefault) {
    const tPtpScaledNs96 scaled;
    EXPECT_EQ(scaled.nanosecondsMsb(), 0);
    EXPECT_EQ(scaled.nanosecondsLsb(), 0U);
    EXPECT_EQ(scaled.fractionalNanoseconds(), 0U);
    EXPECT_EQ(scaled.size(), 12U);
    EXPECT_EQ(serialized(scaled), Octets(12, 0));
}

TEST(PtpScaledNs96Test, FieldsAreReadInWireOrder) {
    const auto scaled = readFrom<tPtpScaledNs96>(octets("7182 93A4B5C6D7E8F90A E1D2"));
    EXPECT_EQ(scaled.nanosecondsMsb(), 0x7182);
    EXPECT_EQ(scaled.nanosecondsLsb(), 0x93A4B5C6D7E8F90AU);
    EXPECT_EQ(scaled.fractionalNanoseconds(), 0xE1D2U);
    EXPECT_EQ(serialized(scaled), octets("7182 93A4B5C6D7E8F90A E1D2"));
}

TEST(PtpScaledNs96Test, EachSetterChangesItsFieldAlone) {
    auto scaled = readFrom<tPtpScaledNs96>(octets("0102 030405060708090A 0B0C"));
    scaled.setNanosecondsMsb(0x7A7B);
    EXPECT_EQ(serialized(scaled), octets("7A7B 030405060708090A 0B0C"));
    scaled.setNanosecondsLsb(0x8182838485868788);
    EXPECT_EQ(serialized(scaled), octets("7A7B 8182838485868788 0B0C"));
    scaled.setFractionalNanoseconds(0x9192);
    EXPECT_EQ(serialized(scaled), octets("7A7B 8182838485868788 9192"));
}

} // namespace
