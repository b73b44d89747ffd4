#include <stdexcept>

#include <syslog.h>

#include <boost/numeric/conversion/cast.hpp>
#include <gtest/gtest.h>

#include "ProtocolConfigFixture.h"

namespace {

class ParameterTest : public testing::Test {
protected:
    template <typename Kind>
    void read(const std::string& configText, const std::string& key) {
        const zekelVantel::tConfigText config(configText);
        zekelVantel::readParameter<Kind>(session, config, key, templateText);
    }

    const SyslogCapture log;
    zekelVantel::tProtocolConfig session;
    std::string templateText = "a $key b $key c $transportSpecific $udsAddress";
};

TEST_F(ParameterTest, FirstPlaceholderOnlyIsReplaced) {
    read<std::string>(R"({"key":"value"})", "key");
    EXPECT_EQ(templateText, "a value b $key c $transportSpecific $udsAddress");
}

TEST_F(ParameterTest, EveryKindHasItsFormat) {
    templateText = "$s $i $u $t $f";
    const std::string configText = R"({"s":"x y","i":-2147483648,"u":4294967295,"t":true,)"
                                   R"("f":false})";
    read<std::string>(configText, "s");
    read<std::int32_t>(configText, "i");
    read<std::uint32_t>(configText, "u");
    read<bool>(configText, "t");
    read<bool>(configText, "f");
    EXPECT_EQ(templateText, "x y -2147483648 4294967295 1 0");
}

TEST_F(ParameterTest, PlaceholderIsFoundAsThePrefixOfALongerOne) {
    templateText = "$keyLong $key";
    read<std::string>(R"({"key":"value"})", "key");
    EXPECT_EQ(templateText, "valueLong $key");
}

TEST_F(ParameterTest, MissingPlaceholderIsLoggedAndRaised) {
    templateText = "no placeholder, key alone";
    try {
        read<std::string>(R"({"key":"value"})", "key");
        FAIL() << "nothing thrown";
    } catch (zeerr::Exception& exception) {
        EXPECT_EQ(exception.status().code, -52005);
        EXPECT_STREQ(exception.what(), R"({"error_constant":"zeoskerr_invalidParameter",)"
                                       R"("file":"tPtp4lTimeRef","line":345,)"
                                       R"("component":"vantel_bc"})");
    }
    EXPECT_EQ(log.lines(),
              (std::vector<SyslogCapture::Line>{
                  {LOG_ERR, "Invalid paramater key in configuration file for vantel"}}));
    EXPECT_EQ(templateText, "no placeholder, key alone");
}

TEST_F(ParameterTest, ValueIsReadBeforeThePlaceholderIsSought) {
    templateText = "";
    EXPECT_THROW(read<std::int32_t>(R"({"key":4e9})", "key"), boost::numeric::positive_overflow);
    EXPECT_TRUE(log.lines().empty());
}

TEST_F(ParameterTest, MissingPlaceholderStoresNothing) {
    templateText = "";
    EXPECT_THROW(read<std::string>(R"({"udsAddress":"a"})", "udsAddress"), zeerr::Exception);
    EXPECT_EQ(session.udsAddress, "");
}

TEST_F(ParameterTest, OnlyAddressAndTransportAreStored) {
    read<std::string>(R"({"key":"7"})", "key");
    EXPECT_EQ(session.udsAddress, "");
    EXPECT_EQ(session.transportSpecific, 0);
    EXPECT_TRUE(session.interfaces.empty());
    EXPECT_EQ(session.configFile, "/var/run/morwen/ClockHub/ptp4l_bc.conf");
}

TEST_F(ParameterTest, TransportWithoutHexadecimalDigitsFailsAfterItWasSubstituted) {
    session.transportSpecific = 5;
    EXPECT_THROW(read<std::string>(R"({"transportSpecific":"zz"})", "transportSpecific"),
                 std::invalid_argument);
    EXPECT_EQ(templateText, "a $key b $key c zz $udsAddress");
    EXPECT_EQ(session.transportSpecific, 5);
}

TEST_F(ParameterTest, TransportOutOfRangeFailsAfterItWasSubstituted) {
    EXPECT_THROW(read<std::string>(R"({"transportSpecific":"ffffffffff"})", "transportSpecific"),
                 std::out_of_range);
    EXPECT_EQ(templateText, "a $key b $key c ffffffffff $udsAddress");
}

} // namespace
