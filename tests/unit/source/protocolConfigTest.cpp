#include "protocolConfig.h"

#include <locale>

#include <gtest/gtest.h>

#include "ProtocolConfigFixture.h"

namespace {

using ProtocolConfigTest = ProtocolConfigFixture;
using Names = std::vector<std::string>;

TEST_F(ProtocolConfigTest, SessionKeepsAddressTransportInterfacesAndPath) {
    set("transportSpecific", "\"0x1\"");
    read();
    EXPECT_EQ(session.udsAddress, "/var/run/ptp4l_bc");
    EXPECT_EQ(session.transportSpecific, 1);
    EXPECT_EQ(session.interfaces, (Names{"eth0", "eth1"}));
    EXPECT_EQ(session.configFile, "ptp4l_bc.conf");
}

TEST_F(ProtocolConfigTest, Priority300IsWrittenAsItIs) {
    set("priority1", "300");
    read();
    EXPECT_TRUE(writtenHasLine("priority1               300"));
}

TEST_F(ProtocolConfigTest, FractionsAreCutTowardsZero) {
    set("priority1", "12.9");
    set("priority2", "-12.9");
    set("neighborPropDelayThreshold", "7.9");
    read();
    EXPECT_TRUE(writtenHasLine("priority1               12"));
    EXPECT_TRUE(writtenHasLine("priority2               -12"));
    EXPECT_TRUE(writtenHasLine("neighborPropDelayThresh 7"));
}

TEST_F(ProtocolConfigTest, NumbersReachTheBoundsOfTheirKind) {
    set("neighborPropDelayThreshold", "4294967295");
    set("priority1", "2147483647");
    set("priority2", "-2147483648");
    read();
    EXPECT_TRUE(writtenHasLine("neighborPropDelayThresh 4294967295"));
    EXPECT_TRUE(writtenHasLine("priority1               2147483647"));
    EXPECT_TRUE(writtenHasLine("priority2               -2147483648"));
}

TEST_F(ProtocolConfigTest, TrueIsWrittenAsOne) {
    set("assumeTwoStep", "true");
    set("pathTraceEnabled", "true");
    set("followUpInfo", "true");
    read();
    EXPECT_TRUE(writtenHasLine("assume_two_step      1"));
    EXPECT_TRUE(writtenHasLine("path_trace_enabled   1"));
    EXPECT_TRUE(writtenHasLine("follow_up_info       1"));
}

TEST_F(ProtocolConfigTest, NullIsTheEmptyValueOfEachKind) {
    session.udsAddress = "former";
    set("neighborPropDelayThreshold", "null");
    set("priority1", "null");
    set("assumeTwoStep", "null");
    set("udsAddress", "null");
    read();
    EXPECT_TRUE(writtenHasLine("neighborPropDelayThresh 0"));
    EXPECT_TRUE(writtenHasLine("priority1               0"));
    EXPECT_TRUE(writtenHasLine("assume_two_step      0"));
    EXPECT_TRUE(writtenHasLine("uds_address       "));
    EXPECT_EQ(session.udsAddress, "");
}

TEST_F(ProtocolConfigTest, TransportSpecificIsWrittenAsTextAndStoredAsHexadecimal) {
    const std::vector<std::pair<std::string, std::int32_t>> values{
        {"0x1", 1},  {"1F", 31},       {"0xff", 255},
        {"10", 16},  {"-1", -1},       {"7fffffff", 2147483647},
        {" 0x2", 2}, {"3 and more", 3}};
    for (const auto& [value, stored] : values) {
        set("transportSpecific", "\"" + value + "\"");
        read();
        EXPECT_TRUE(writtenHasLine("transportSpecific " + value)) << value;
        EXPECT_EQ(session.transportSpecific, stored) << value;
    }
}

TEST_F(ProtocolConfigTest, StringsGoIntoTheFileAsTheyAre) {
    set("ptpDstMac", R"("a \"b\"\nnext\tline")");
    set("networkTransport", "\"\"");
    read();
    EXPECT_TRUE(writtenHasLine("ptp_dst_mac       a \"b\"\nnext\tline"));
    EXPECT_TRUE(writtenHasLine("network_transport    "));
}

TEST_F(ProtocolConfigTest, LaterPlaceholderInAValueIsFilledInstead) {
    set("udsAddress", "\"$delayMechanism\"");
    read();
    EXPECT_TRUE(writtenHasLine("uds_address       E2E"));
    EXPECT_TRUE(writtenHasLine("delay_mechanism      $delayMechanism"));
    EXPECT_EQ(session.udsAddress, "$delayMechanism");
}

TEST_F(ProtocolConfigTest, EarlierOrOwnPlaceholderInAValueStays) {
    set("udsAddress", "\"$udsAddress\"");
    set("networkTransport", "\"$priority1\"");
    read();
    EXPECT_TRUE(writtenHasLine("uds_address       $udsAddress"));
    EXPECT_TRUE(writtenHasLine("network_transport    $priority1"));
    EXPECT_TRUE(writtenHasLine("priority1               128"));
}

TEST_F(ProtocolConfigTest, KeysAreFoundWhateverTheirCase) {
    remove("priority1");
    set("PRIORITY1", "7");
    read();
    EXPECT_TRUE(writtenHasLine("priority1               7"));
}

TEST_F(ProtocolConfigTest, OtherMembersAreIgnored) {
    set("twoStepFlag", "[1,{\"priority1\":3}]");
    read();
    EXPECT_TRUE(writtenHasLine("twoStepFlag             1"));
    EXPECT_TRUE(writtenHasLine("priority1               128"));
}

TEST_F(ProtocolConfigTest, InterfacesReplaceTheFormerOnes) {
    session.interfaces = {"former"};
    set("interface", R"(["b","a","b"])");
    read();
    EXPECT_EQ(session.interfaces, (Names{"b", "a", "b"}));
}

TEST_F(ProtocolConfigTest, EmptyInterfaceArrayIsAccepted) {
    session.interfaces = {"former"};
    set("interface", "[]");
    read();
    EXPECT_TRUE(session.interfaces.empty());
    EXPECT_NE(written(), "");
}

TEST_F(ProtocolConfigTest, NullConfigFileKeepsTheDefaultPath) {
    EXPECT_EQ(session.configFile, "/var/run/morwen/ClockHub/ptp4l_bc.conf");
    session.configFile = "kept.conf";
    set("configFile", "null");
    read();
    EXPECT_EQ(session.configFile, "kept.conf");
    EXPECT_NE(readFile("kept.conf"), "");
    EXPECT_EQ(written(), "");
}

class Grouping : public std::numpunct<char> {
protected:
    char do_decimal_point() const override { return ','; }
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
    std::string do_truename() const override { return "wahr"; }
};

TEST_F(ProtocolConfigTest, GlobalCppLocaleChangesNothing) {
    set("priority1", "12.9");
    const std::locale former = std::locale::global(std::locale(std::locale(), new Grouping));
    read();
    std::locale::global(former);
    EXPECT_TRUE(writtenHasLine("neighborPropDelayThresh 20000000"));
    EXPECT_TRUE(writtenHasLine("offsetScaledLogVariance 65535"));
    EXPECT_TRUE(writtenHasLine("priority1               12"));
}

} // namespace
