#include "tPtp4lTimeStatusMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lTimeStatusMgmtTlv;

namespace {

TEST(Ptp4lTimeStatusMgmtTlvTest, FreshObjectCarriesItsIdAndLength) {
    const tPtp4lTimeStatusMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.lengthField(), 52U);
    EXPECT_EQ(tlv.managementId(), 0xC000U);
    EXPECT_EQ(tlv.size(), 56U);
    EXPECT_EQ(serialized(tlv), octets("0001 0034 C000") + Octets(50, 0));
}

TEST(Ptp4lTimeStatusMgmtTlvTest, FieldsAreReadInWireOrder) {
    const Octets wire =
        octets("A1B2 C3D4 E5F6 8182838485868788 7192939495969798 A9AAABAC BDBEBFC0 D1D2"
               "6364 E5E6E7E8E9EAEBEC EDEE F1F2F3F4 91939597999B9D9F");
    const auto tlv = readFrom<tPtp4lTimeStatusMgmtTlv>(wire);
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
    EXPECT_EQ(serialized(tlv), wire);
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

} // namespace
