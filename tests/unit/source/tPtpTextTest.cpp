#include "tPtpText.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tMsgBuffer;
using zekelVantel::tPtpText;

namespace {

std::string longText() {
    std::string text;
    for (int index = 0; index < 255; ++index) {
        text += static_cast<char>('!' + index % 90);
    }
    return text;
}

Octets characters(const std::string& text) {
    return {text.begin(), text.end()};
}

struct TextCase {
    const char* name;
    Octets wire;
    std::string text;
};

class PtpTextLengthTest : public testing::TestWithParam<TextCase> {};

TEST_P(PtpTextLengthTest, IsReadWholeAndSentBackTheSame) {
    const TextCase& expected = GetParam();
    const auto text = readFrom<tPtpText>(expected.wire);
    EXPECT_EQ(text.lengthField(), expected.text.size());
    EXPECT_EQ(text.text(), expected.text);
    EXPECT_EQ(text.size(), expected.text.size() + 1);
    EXPECT_EQ(serialized(text), expected.wire);
}

TEST_P(PtpTextLengthTest, NoPadOctetIsConsumed) {
    const TextCase& expected = GetParam();
    tPtpText text;
    EXPECT_EQ(octetsConsumed(text, expected.wire + octets("00 00")), expected.wire.size());
}

TEST_P(PtpTextLengthTest, TextCutAnywhereChangesNothing) {
    tPtpText text;
    expectEachFieldAsItIsRead(text, octets("03 6F 6C 64"), GetParam().wire, {});
    EXPECT_EQ(readInto(text, GetParam().wire), 0);
    EXPECT_EQ(serialized(text), GetParam().wire);
}

INSTANTIATE_TEST_SUITE_P(
    EveryLength, PtpTextLengthTest,
    testing::Values(TextCase{"Empty", octets("00"), ""},
                    TextCase{"OfFour", octets("04 65 74 68 30"), "eth0"},
                    TextCase{"OfFive", octets("05 73 79 6E 63 37"), "sync7"},
                    TextCase{"Longest", octets("FF") + characters(longText()), longText()}),
    [](const testing::TestParamInfo<TextCase>& tested) { return tested.param.name; });

TEST(PtpTextTest, IsEmptyByDefault) {
    const tPtpText text;
    EXPECT_EQ(text.lengthField(), 0U);
    EXPECT_EQ(text.text(), "");
    EXPECT_EQ(text.size(), 1U);
    EXPECT_EQ(serialized(text), octets("00"));
}

TEST(PtpTextTest, ZeroOctetEndsTheTextAndTheLengthStaysAsReceived) {
    const auto text = readFrom<tPtpText>(octets("05 61 62 00 63 64"));
    EXPECT_EQ(text.lengthField(), 5U);
    EXPECT_EQ(text.text(), "ab");
    EXPECT_EQ(text.size(), 6U);
    EXPECT_EQ(serialized(text), octets("05 61 62"));
}

TEST(PtpTextTest, ZeroOctetsAreConsumedWithTheRest) {
    tPtpText text;
    EXPECT_EQ(octetsConsumed(text, octets("05 61 62 00 63 64 65")), 6U);
}

TEST(PtpTextTest, LengthBeyondTheDataChangesNothing) {
    auto text = readFrom<tPtpText>(octets("02 68 69"));
    EXPECT_EQ(readInto(text, octets("FF 61 62 63")), endOfData);
    EXPECT_EQ(text.lengthField(), 2U);
    EXPECT_EQ(text.text(), "hi");
}

TEST(PtpTextTest, OctetsAbove127AreKept) {
    const auto text = readFrom<tPtpText>(octets("03 C3 A9 FF"));
    EXPECT_EQ(text.text(), "\xC3\xA9\xFF");
    EXPECT_EQ(serialized(text), octets("03 C3 A9 FF"));
}

TEST(PtpTextTest, ShorterTextReplacesALongerOne) {
    auto text = readFrom<tPtpText>(octets("05 73 79 6E 63 37"));
    EXPECT_EQ(readInto(text, octets("01 78")), 0);
    EXPECT_EQ(text.text(), "x");
    EXPECT_EQ(serialized(text), octets("01 78"));
}

TEST(PtpTextTest, TextIsGivenAsACopy) {
    const auto text = readFrom<tPtpText>(octets("02 68 69"));
    std::string copy = text.text();
    copy += "!";
    EXPECT_EQ(text.text(), "hi");
}

} // namespace
