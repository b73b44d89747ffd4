#include "tPtp4lPortPropertiesMgmtTlv.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtp4lPortPropertiesMgmtTlv;

namespace {

std::string longName() {
    std::string name;
    for (int index = 0; index < 255; ++index) {
        name += static_cast<char>('!' + index % 90);
    }
    return name;
}

/// The text as the wire has it, without its length.
Octets characters(const std::string& text) {
    return {text.begin(), text.end()};
}

const Octets data = octets("8182838485868788 898A 9B AC");
const Octets padded = octets("0001 0014 C004 0102030405060708 090A 0B 0C 04 65746830 00");
const Octets unpadded = octets("0001 0014 C004 8182838485868788 898A 9B AC 05 73796E6337");

TEST(Ptp4lPortPropertiesMgmtTlvTest, FreshObjectHasAnEmptyNameAndAPadOctet) {
    const tPtp4lPortPropertiesMgmtTlv tlv;
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.size(), 19U);
    EXPECT_EQ(tlv.lengthField(), 16U);
    EXPECT_EQ(tlv.managementId(), 0xC004U);
    EXPECT_EQ(serialized(tlv), octets("0001 0010 C004 0000000000000000 0000 03 00 00 00"));
}

TEST(Ptp4lPortPropertiesMgmtTlvTest, FieldsAreReadInWireOrder) {
    const auto tlv = readFrom<tPtp4lPortPropertiesMgmtTlv>(unpadded);
    EXPECT_EQ(tlv.tlvType(), 1U);
    EXPECT_EQ(tlv.managementId(), 0xC004U);
    EXPECT_EQ(serialized(tlv.portIdentity().clockIdentity()), octets("8182838485868788"));
    EXPECT_EQ(tlv.portIdentity().portNumber(), 0x898AU);
    EXPECT_EQ(tlv.portState(), 0x9BU);
    EXPECT_EQ(tlv.timestamping(), 0xACU);
    EXPECT_EQ(tlv.interface().text(), "sync7");
    EXPECT_EQ(serialized(tlv), unpadded);
}

TEST(Ptp4lPortPropertiesMgmtTlvTest, AnswersOfTheRealDaemonAreRead) {
    const Octets even = octets("0001 0014 c004 8a3d5bfffe0caf07 0002 06 00 04 76654131 00");
    const auto initialising = readFrom<tPtp4lPortPropertiesMgmtTlv>(even);
    EXPECT_EQ(initialising.portIdentity().portNumber(), 2U);
    EXPECT_EQ(initialising.portState(), 6U);
    EXPECT_EQ(initialising.interface().text(), "veA1");
    EXPECT_EQ(serialized(initialising), even);
    const Octets odd = octets("0001 0014 c004 a20f5efffe5b6683 0001 08 00 05 73796e6330");
    const auto uncalibrated = readFrom<tPtp4lPortPropertiesMgmtTlv>(odd);
    EXPECT_EQ(uncalibrated.portState(), 8U);
    EXPECT_EQ(uncalibrated.interface().text(), "sync0");
    EXPECT_EQ(serialized(uncalibrated), odd);
}

struct NameCase {
    const char* name;
    Octets head; ///< as it is to be sent: with the lengthField
    std::string interface;
    Octets pad;
    std::uint32_t size;

    Octets wire() const {
        const auto length = static_cast<std::uint8_t>(interface.size());
        return head + data + Octets{length} + characters(interface) + pad;
    }
};

class PortNameTest : public testing::TestWithParam<NameCase> {};

TEST_P(PortNameTest, DecidesSizeLengthFieldAndPad) {
    const NameCase& expected = GetParam();
    const auto tlv = readFrom<tPtp4lPortPropertiesMgmtTlv>(expected.wire());
    EXPECT_EQ(tlv.interface().text(), expected.interface);
    EXPECT_EQ(tlv.size(), expected.size);
    EXPECT_EQ(tlv.lengthField(), expected.head.at(2) << 8 | expected.head.at(3));
    EXPECT_EQ(serialized(tlv), expected.wire());
}

TEST_P(PortNameTest, LengthFieldIsTheSendersAndNotTheReceived) {
    Octets wire = GetParam().wire();
    wire[2] = 0x77;
    wire[3] = 0x89;
    EXPECT_EQ(serialized(readFrom<tPtp4lPortPropertiesMgmtTlv>(wire)), GetParam().wire());
}

TEST_P(PortNameTest, PadOctetIsNotConsumed) {
    const Octets wire = GetParam().wire() + octets("EE");
    tPtp4lPortPropertiesMgmtTlv tlv;
    EXPECT_EQ(octetsConsumed(tlv, wire), GetParam().size);
}

TEST_P(PortNameTest, PadOctetMayBeMissing) {
    const Octets wire = first(GetParam().size, GetParam().wire());
    EXPECT_EQ(serialized(readFrom<tPtp4lPortPropertiesMgmtTlv>(wire)), GetParam().wire());
}

TEST_P(PortNameTest, DataSetCutAnywhereChangesNothingButTheHead) {
    Octets next = first(GetParam().size, GetParam().wire());
    next[0] = 0xA1;
    next[2] = 0x77;
    next[3] = 0x89;
    next[4] = 0xE5;
    tPtp4lPortPropertiesMgmtTlv tlv;
    expectEachFieldAsItIsRead(tlv, padded, next, {2, 4, 6});
    expectEachFieldAsItIsRead(tlv, unpadded, next, {2, 4, 6});
}

TEST_P(PortNameTest, ReplacesAnotherName) {
    for (const Octets& before : {padded, unpadded}) {
        auto tlv = readFrom<tPtp4lPortPropertiesMgmtTlv>(before);
        EXPECT_EQ(readInto(tlv, GetParam().wire()), 0);
        EXPECT_EQ(serialized(tlv), GetParam().wire());
    }
}

INSTANTIATE_TEST_SUITE_P(
    EveryLength, PortNameTest,
    testing::Values(NameCase{"Empty", octets("0001 0010 C004"), "", octets("00"), 19},
                    NameCase{"OfFour", octets("0001 0014 C004"), "eth0", octets("00"), 23},
                    NameCase{"OfFive", octets("0001 0014 C004"), "sync7", {}, 24},
                    NameCase{"Longest", octets("0001 010E C004"), longName(), {}, 274}),
    [](const testing::TestParamInfo<NameCase>& tested) { return tested.param.name; });

TEST(Ptp4lPortPropertiesMgmtTlvTest, LengthFieldIsRecomputedOnlyAfterSuccess) {
    tPtp4lPortPropertiesMgmtTlv tlv;
    EXPECT_EQ(readInto(tlv, octets("0001 7789 C004 8182838485868788 898A 9B AC 05 7379")),
              endOfData);
    EXPECT_EQ(tlv.lengthField(), 0x7789U);
    EXPECT_EQ(tlv.size(), 19U);
    EXPECT_EQ(serialized(tlv), octets("0001 7789 C004 0000000000000000 0000 03 00 00 00"));
    EXPECT_EQ(readInto(tlv, unpadded), 0);
    EXPECT_EQ(tlv.lengthField(), 20U);
}

TEST(Ptp4lPortPropertiesMgmtTlvTest, ZeroOctetEndsTheNameAndTheSizeStaysAsReceived) {
    const auto odd = readFrom<tPtp4lPortPropertiesMgmtTlv>(
        octets("0001 0014 C004 8182838485868788 898A 9B AC 05 6162006364"));
    EXPECT_EQ(odd.interface().text(), "ab");
    EXPECT_EQ(odd.interface().lengthField(), 5U);
    EXPECT_EQ(odd.size(), 24U);
    EXPECT_EQ(odd.lengthField(), 20U);
    EXPECT_EQ(serialized(odd), octets("0001 0014 C004 8182838485868788 898A 9B AC 05 6162"));
    const auto even = readFrom<tPtp4lPortPropertiesMgmtTlv>(
        octets("0001 0014 C004 8182838485868788 898A 9B AC 04 61620063 00"));
    EXPECT_EQ(even.size(), 23U);
    EXPECT_EQ(serialized(even), octets("0001 0014 C004 8182838485868788 898A 9B AC 04 6162 00"));
}

} // namespace
