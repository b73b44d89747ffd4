#include "tPtp4lMetaData.h"

#include <cstdio>
#include <map>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include "support/PtpSituation.h"

using testing::HasSubstr;
using zekelVantel::tPtp4lMetaData;

namespace {

std::string twoDigits(unsigned octet) {
    char text[16];
    std::snprintf(text, sizeof(text), "%02X", octet & 0xffU);
    return text;
}

std::string jsonWithGrandmaster(std::uint64_t identity) {
    PtpSituation situation;
    situation.parent.grandmasterIdentity = zekelVantel::tPtpClockIdentity(identity);
    return metaDataOf(situation).toJson();
}

std::string jsonWithPortState(std::uint8_t portState) {
    PtpSituation situation;
    addPort(situation, 1);
    situation.portDataSets.at(0).portState = portState;
    return metaDataOf(situation).toJson();
}

std::string jsonWithInterface(const std::string& interface) {
    PtpSituation situation;
    addPort(situation, 1, interface);
    return metaDataOf(situation).toJson();
}

TEST(PtpMetaDataNamesTest, EveryClockAccuracyHasItsName) {
    const std::map<unsigned, std::string> names = {
        {0x20, "WITHIN_25NS"},     {0x21, "WITHIN_100NS"}, {0x22, "WITHIN_250NS"},
        {0x23, "WITHIN_1US"},      {0x24, "WITHIN_2.5US"}, {0x25, "WITHIN_10US"},
        {0x26, "WITHIN_25US"},     {0x27, "WITHIN_100US"}, {0x28, "WITHIN_250US"},
        {0x29, "WITHIN_1MS"},      {0x2A, "WITHIN_2.5MS"}, {0x2B, "WITHIN_10MS"},
        {0x2C, "WITHIN_25MS"},     {0x2D, "WITHIN_100MS"}, {0x2E, "WITHIN_250MS"},
        {0x2F, "WITHIN_1S"},       {0x30, "WITHIN_10S"},   {0x31, "GREATER_THAN_10S"},
        {0xFE, "ACCURACY_UNKNOWN"}};
    for (unsigned value = 0; value < 256; ++value) {
        const auto found = names.find(value);
        const std::string name = found == names.end() ? "ACCURACY_UNKNOWN" : found->second;
        PtpSituation grandmaster;
        grandmaster.parent.grandmasterClockQuality = clockQuality("00" + twoDigits(value) + "0000");
        EXPECT_THAT(metaDataOf(grandmaster).toJson(),
                    HasSubstr(R"(,"gmClockAccuracy":")" + name + R"(",)"))
            << value;
        PtpSituation local;
        local.local.clockQuality = clockQuality("00" + twoDigits(value) + "0000");
        EXPECT_THAT(metaDataOf(local).toJson(), HasSubstr(R"(,"clockAccuracy":")" + name + R"(",)"))
            << value;
    }
}

TEST(PtpMetaDataNamesTest, EveryPortStateHasItsNameAndThoseAboveTenNone) {
    const std::vector<std::string> names = {"",
                                            "PTP_INITIALIZING",
                                            "PTP_FAULTY",
                                            "PTP_DISABLED",
                                            "PTP_LISTENING",
                                            "PTP_PRE_MASTER",
                                            "PTP_MASTER",
                                            "PTP_PASSIVE",
                                            "PTP_UNCALIBRATED",
                                            "PTP_SLAVE",
                                            "PTP_GRAND_MASTER"};
    for (unsigned value = 0; value < 256; ++value) {
        const std::string name = value < names.size() ? names[value] : "";
        EXPECT_THAT(jsonWithPortState(static_cast<std::uint8_t>(value)),
                    HasSubstr(R"("Port1":{"portState":")" + name + R"(","asCapable")"))
            << value;
    }
}

TEST(PtpMetaDataNamesTest, EveryOctetOfAnIdentityHasTwoUpperCaseDigits) {
    for (unsigned octet = 0; octet < 256; ++octet) {
        const std::string digits = twoDigits(octet);
        const std::string json = jsonWithGrandmaster(std::uint64_t{octet} << 56 | octet);
        EXPECT_THAT(json, HasSubstr(R"("gmClockId":")" + digits + ":00:00:00:00:00:00:" + digits +
                                    R"(","gmMacAddress":")" + digits + ":00:00:00:00:" + digits +
                                    R"(",)"));
    }
}

TEST(PtpMetaDataNamesTest, MacAddressLeavesTheTwoMiddleOctetsOut) {
    EXPECT_THAT(jsonWithGrandmaster(0x001B21FFFE0A0B0C),
                HasSubstr(R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C",)"
                          R"("gmMacAddress":"00:1B:21:0A:0B:0C",)"));
    EXPECT_THAT(jsonWithGrandmaster(0x0102030405060708),
                HasSubstr(R"({"gmClockId":"01:02:03:04:05:06:07:08",)"
                          R"("gmMacAddress":"01:02:03:06:07:08",)"));
    EXPECT_THAT(jsonWithGrandmaster(0xABCDEF0000ABCDEF),
                HasSubstr(R"({"gmClockId":"AB:CD:EF:00:00:AB:CD:EF",)"
                          R"("gmMacAddress":"AB:CD:EF:AB:CD:EF",)"));
}

TEST(PtpMetaDataNamesTest, LocalClockIdentityIsWrittenAlike) {
    PtpSituation situation;
    situation.local.clockIdentity = zekelVantel::tPtpClockIdentity(0xA0B1C2FFFED3E4F5);
    EXPECT_THAT(metaDataOf(situation).toJson(),
                HasSubstr(R"("localClockId":"A0:B1:C2:FF:FE:D3:E4:F5",)"));
}

TEST(PtpMetaDataNamesTest, OrdinaryInterfaceNamesStayAsTheyAre) {
    for (const std::string name :
         {"eth0", "enp10s0f1", "eth0.100", "br-lan", "wlan_0", "p/q", ""}) {
        EXPECT_THAT(jsonWithInterface(name),
                    HasSubstr(R"("interface":")" + name + R"(","neighborPropDelayThreshold")"));
    }
}

TEST(PtpMetaDataNamesTest, InterfaceNameEndsAtItsFirstZeroOctet) {
    EXPECT_THAT(jsonWithInterface(std::string("et\0h0", 5)), HasSubstr(R"("interface":"et",)"));
}

TEST(PtpMetaDataNamesTest, QuotesBackslashesAndControlCharactersAreEscaped) {
    const std::map<std::string, std::string> escapes = {
        {"\"", R"(\")"},         {"\\", R"(\\)"},     {"\b", R"(\b)"},
        {"\t", R"(\t)"},         {"\n", R"(\n)"},     {"\f", R"(\f)"},
        {"\r", R"(\r)"},         {"\x01", "\\u0001"}, {"\x07", "\\u0007"},
        {"\x0b", "\\u000b"},     {"\x0e", "\\u000e"}, {"\x1b", "\\u001b"},
        {"\x1f", "\\u001f"},     {"\x7f", "\\u007f"}, {R"(","a":")", R"(\",\"a\":\")"},
        {"a\\\"b", R"(a\\\"b)"}, {"}\n{", R"(}\n{)"}, {" ", " "}};
    for (const auto& [name, escaped] : escapes) {
        EXPECT_THAT(jsonWithInterface(name),
                    HasSubstr(R"("interface":")" + escaped + R"(","neighborPropDelayThreshold")"));
    }
}

TEST(PtpMetaDataNamesTest, OctetsFrom128OnStayAsTheyAre) {
    for (const std::string name : {"\xC3\xA9th0", "\xE2\x82\xAC", "\x80", "\xFF\xFE"}) {
        EXPECT_THAT(jsonWithInterface(name),
                    HasSubstr(R"("interface":")" + name + R"(","neighborPropDelayThreshold")"));
    }
}

TEST(PtpMetaDataNamesTest, AParserReadsEveryCharacterBack) {
    for (unsigned character = 1; character < 128; ++character) {
        const std::string name = "a" + std::string(1, static_cast<char>(character)) + "b";
        const auto json = nlohmann::ordered_json::parse(jsonWithInterface(name));
        EXPECT_EQ(json.at("Port1").at("interface"), name) << character;
        EXPECT_EQ(json.size(), 15U);
    }
    const std::string unicode = "\xC3\xA9\xE2\x82\xAC\xF0\x9F\x95\x90";
    const auto json = nlohmann::ordered_json::parse(jsonWithInterface(unicode));
    EXPECT_EQ(json.at("Port1").at("interface"), unicode);
}

TEST(PtpMetaDataNamesTest, AParserReadsTheLongestNameBackHoweverMuchIsEscaped) {
    const std::string name(255, '\x01');
    const auto json = nlohmann::ordered_json::parse(jsonWithInterface(name));
    EXPECT_EQ(json.at("Port1").at("interface"), name);
}

} // namespace
