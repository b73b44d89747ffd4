#include "tPtp4lTimeStatusMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lTimeStatusMgmtTlv;

namespace tPtp4lTimeStatusMgmtTlvTest {

const Octets before =
    octets("0102 0304 0506 0708090A0B0C0D0E 1112131415161718 191A1B1C 1D1E1F20 2122"
           "2324 25262728292A2B2C 2D2E 2F303132 3334353637383940");
const Octets next = octets("A1B2 C3D4 E5F6 8182838485868788 7192939495969798 A9AAABAC BDBEBFC0 D1D2"
                           "6364 E5E6E7E8E9EAEBEC EDEE F1F2F3F4 91939597999B9D9F");

TEST(Ptp4lTimeStatusMgmtTlvTest, FreshObjectCarriesItsIdAndLength) {
    const tPtp4lTimeStatusMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 52U);
    EXPECT_EQ(tlv.managementId(), 0xC000U);
    EXPECT_EQ(tlv.size(), 56U);
    EXPECT_EQ(serialized(tlv), octets("0001 0034 C000") + Octets(50, 0));
}

TEST(Ptp4lTimeStatusMgmtTlvTest, FieldsAreReadInWireOrder) {
    const auto tlv = readFrom<tPtp4lTimeStatusMgmtTlv>(next);
    EXPECT_EQ(tlv.tlvType(), 0xA1B2U);
    EXPECT_EQ(tlv.lengthField(), 0xC3D4U);
    EXPECT_EQ(tlv.managementId(), 0xE5F6U);
    EXPECT_EQ(tlv.masterOffset(), -0x7E7D7C7B7A797878);
    EXPECT_EQ(tlv.ingressTime(), 0x7192939495969798);
    EXPECT_EQ(tlv.cumulativeScaledRateOffset(), -0x56555454);
    EXPECT_EQ(tlv.scaledLastGmPhaseChange(), -0x42414040);
    EXPECT_EQ(tlv.gmTimeBaseIndicator(), 0xD1D2U);
    EXPECT_EQ(tlv.lastGmPhaseChange().nanosecondsMsb(), 0x6364);
    EXPECT_EQ(tlv.lastGmPhaseChange().nanosecondsLsb(), 0xE5E6E7E8E9EAEBECU);
    EXPECT_EQ(tlv.lastGmPhaseChange().fractionalNanoseconds(), 0xEDEEU);
    EXPECT_EQ(tlv.gmPresent(), -0x0E0D0C0C);
    EXPECT_EQ(serialized(tlv.gmIdentity()), octets("91939597999B9D9F"));
    EXPECT_EQ(tlv.size(), 56U);
    EXPECT_EQ(serialized(tlv), next);
}

TEST(Ptp4lTimeStatusMgmtTlvTest, AnswerOfTheRealDaemonIsRead) {
    const Octets answer =
        octets("0001 0034 c000 0000000000000236 18ea00861ae391fe 00000000 00000000 0000"
               "000000000000000000000000 00000001 a65c12fffe175c7d");
    const auto tlv = readFrom<tPtp4lTimeStatusMgmtTlv>(answer);
    EXPECT_EQ(tlv.masterOffset(), 566);
    EXPECT_EQ(tlv.ingressTime(), 0x18EA00861AE391FE);
    EXPECT_EQ(tlv.gmPresent(), 1);
    EXPECT_EQ(serialized(tlv.gmIdentity()), octets("a65c12fffe175c7d"));
    EXPECT_EQ(serialized(tlv), answer);
}

TEST(Ptp4lTimeStatusMgmtTlvTest, TimesBeyond32BitsOfSecondsAreKeptToTheNanosecond) {
    struct Row {
        const char* octets;
        std::int64_t time;
    };
    // The last nanosecond of 31 and of 32 bits of seconds, the first ones after them, and the last
    // of all: 2038, 2106, 2262.
    for (const auto& row :
         {Row{"1DCD64FFFFFFFFFF", 2147483647999999999},
          Row{"1DCD650000000000", 2147483648000000000},
          Row{"3B9AC9FFFFFFFFFF", 4294967295999999999},
          Row{"3B9ACA0000000001", 4294967296000000001}, Row{"7FFFFFFFFFFFFFFF", INT64_MAX}}) {
        const Octets answer = octets(std::string("0001 0034 C000") + row.octets + row.octets +
                                     "00000000 00000000 0000 000000000000000000000000 00000001"
                                     "a65c12fffe175c7d");
        const auto tlv = readFrom<tPtp4lTimeStatusMgmtTlv>(answer);
        EXPECT_EQ(tlv.masterOffset(), row.time);
        EXPECT_EQ(tlv.ingressTime(), row.time);
        EXPECT_EQ(serialized(tlv), answer);
    }
}

TEST(Ptp4lTimeStatusMgmtTlvTest, DataCutAnywhereKeepsWhatWasReadBefore) {
    expectEachFieldAsItIsRead<tPtp4lTimeStatusMgmtTlv>(before, next,
                                                       {2, 4, 6, 14, 22, 26, 30, 32, 44, 48, 56});
}

TEST(Ptp4lTimeStatusMgmtTlvTest, ReadsItsSizeAndNoMore) {
    EXPECT_EQ(octetsConsumed<tPtp4lTimeStatusMgmtTlv>(Octets(61, 0x42)), 56U);
}

TEST(Ptp4lTimeStatusMgmtTlvTest, OnlyAnErrorStopsReading) {
    expectOnlyAnErrorStopsReading<tPtp4lTimeStatusMgmtTlv>(before, next);
}

TEST(Ptp4lTimeStatusMgmtTlvTest, NoRoomIsEndOfData) {
    expectNoRoomIsEndOfData<tPtp4lTimeStatusMgmtTlv>(next);
}

} // namespace tPtp4lTimeStatusMgmtTlvTest
