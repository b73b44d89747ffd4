#include "tPtpScaledNs96.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpScaledNs96;

namespace tPtpScaledNs96Test {

const Octets before = octets("01 02 03 04 05 06 07 08 09 0A 0B 0C");
const Octets next = octets("F1 F2 F3 F4 F5 F6 F7 F8 F9 FA FB FC");

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
    auto scaled = readFrom<tPtpScaledNs96>(before);
    scaled.setNanosecondsMsb(0x7A7B);
    EXPECT_EQ(serialized(scaled), octets("7A7B 030405060708090A 0B0C"));
    scaled.setNanosecondsLsb(0x8182838485868788);
    EXPECT_EQ(serialized(scaled), octets("7A7B 8182838485868788 0B0C"));
    scaled.setFractionalNanoseconds(0x9192);
    EXPECT_EQ(serialized(scaled), octets("7A7B 8182838485868788 9192"));
}

TEST(PtpScaledNs96Test, ReadsTwelveOctetsAndNoMore) {
    EXPECT_EQ(octetsConsumed<tPtpScaledNs96>(Octets(15, 0x42)), 12U);
}

TEST(PtpScaledNs96Test, ValueCutAnywhereChangesNothing) {
    expectAllOrNothing<tPtpScaledNs96>(before, next);
}

TEST(PtpScaledNs96Test, OnlyAnErrorStopsReading) {
    expectOnlyAnErrorStopsReading<tPtpScaledNs96>(before, next);
}

TEST(PtpScaledNs96Test, NoRoomIsEndOfData) {
    expectNoRoomIsEndOfData<tPtpScaledNs96>(next);
}

} // namespace tPtpScaledNs96Test
