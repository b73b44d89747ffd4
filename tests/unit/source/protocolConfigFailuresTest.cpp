#include <ostream>

#include <syslog.h>

#include <gtest/gtest.h>

#include "ProtocolConfigFixture.h"
#include "support/ErrorText.h"

namespace {

using Lines = std::vector<SyslogCapture::Line>;

constexpr const char* templateKeys[] = {"neighborPropDelayThreshold",
                                        "logAnnounceInterval",
                                        "logSyncInterval",
                                        "priority1",
                                        "priority2",
                                        "offsetScaledLogVariance",
                                        "udsAddress",
                                        "transportSpecific",
                                        "syncReceiptTimeout",
                                        "assumeTwoStep",
                                        "pathTraceEnabled",
                                        "followUpInfo",
                                        "networkTransport",
                                        "delayMechanism",
                                        "ptpDstMac"};

std::string invalidParameter(int line) {
    return errorText("zeoskerr_invalidParameter", "tPtp4lTimeRef", line);
}

std::string softwareFault(const std::string& what) {
    return R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
           R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
           R"("std_exception_what":")" +
           what + "\"}";
}

std::string parameterTypeMismatch(const std::string& configText, const std::string& key) {
    std::string quoted;
    for (const char character : configText) {
        quoted += character == '"' ? "\\\"" : std::string(1, character);
    }
    return R"({"error_constant":"errCode","file":"jsonHelperFunctions","line":50,)"
           R"("component":"vantel_bc","zesync_debug":{"message":"Error parsing: expected data )"
           R"(type does not match the parsed value.","JSON":")" +
           quoted + R"(","key":")" + key + R"("}})";
}

Lines keyNotFound(const std::string& key) {
    return {{LOG_ERR, "Key " + key + " not found in protocol config for vantel"}};
}

using ProtocolConfigFailuresTest = ProtocolConfigFixture;

class MissingKeyTest : public ProtocolConfigFixture,
                       public testing::WithParamInterface<const char*> {};

TEST_P(MissingKeyTest, IsAnErrorThoughTheSchemaHasADefault) {
    remove(GetParam());
    readToFailure();
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.json, invalidParameter(337));
    EXPECT_EQ(log.lines(), keyNotFound(GetParam()));
}

TEST_P(MissingKeyTest, IsNoticedBeforeAllLaterKeys) {
    bool later = false;
    for (const std::string key : templateKeys) {
        later = later || key == GetParam();
        if (later) {
            remove(key);
        }
    }
    remove("configFile");
    remove("interface");
    readToFailure();
    EXPECT_EQ(log.lines(), keyNotFound(GetParam()));
}

INSTANTIATE_TEST_SUITE_P(Keys, MissingKeyTest, testing::ValuesIn(templateKeys),
                         [](const auto& key) { return std::string(key.param); });

struct WrongType {
    const char* key;
    const char* value;
};

void PrintTo(const WrongType& row, std::ostream* out) {
    *out << row.key << ": " << row.value;
}

class WrongTypeTest : public ProtocolConfigFixture,
                      public testing::WithParamInterface<WrongType> {};

TEST_P(WrongTypeTest, IsReportedWithTheKeyAndTheConfiguration) {
    set(GetParam().key, GetParam().value);
    readToFailure();
    EXPECT_EQ(status.code, -52004);
    EXPECT_EQ(status.json, parameterTypeMismatch(text(), GetParam().key));
    EXPECT_TRUE(log.lines().empty());
}

INSTANTIATE_TEST_SUITE_P(
    Values, WrongTypeTest,
    testing::Values(WrongType{"neighborPropDelayThreshold", "\"1\""},
                    WrongType{"logAnnounceInterval", "true"}, WrongType{"logSyncInterval", "[]"},
                    WrongType{"priority1", "\"128\""}, WrongType{"priority2", "{}"},
                    WrongType{"offsetScaledLogVariance", "false"}, WrongType{"udsAddress", "1"},
                    WrongType{"transportSpecific", "0"}, WrongType{"syncReceiptTimeout", "\"\""},
                    WrongType{"assumeTwoStep", "1"}, WrongType{"pathTraceEnabled", "\"true\""},
                    WrongType{"followUpInfo", "0"}, WrongType{"networkTransport", "[\"UDPv4RAW\"]"},
                    WrongType{"delayMechanism", "{}"}, WrongType{"ptpDstMac", "true"},
                    WrongType{"configFile", "1"}, WrongType{"configFile", "[\"ptp4l_bc.conf\"]"}));

struct OutOfRange {
    const char* key;
    const char* value;
    const char* what;
};

void PrintTo(const OutOfRange& row, std::ostream* out) {
    *out << row.key << ": " << row.value;
}

class OutOfRangeTest : public ProtocolConfigFixture,
                       public testing::WithParamInterface<OutOfRange> {};

TEST_P(OutOfRangeTest, ReachesTheHostAsASoftwareFault) {
    set(GetParam().key, GetParam().value);
    readToFailure();
    EXPECT_EQ(status.code, -52003);
    EXPECT_EQ(status.json, softwareFault(GetParam().what));
    EXPECT_TRUE(log.lines().empty());
}

constexpr char tooLow[] = "bad numeric conversion: negative overflow";
constexpr char tooHigh[] = "bad numeric conversion: positive overflow";

INSTANTIATE_TEST_SUITE_P(
    Values, OutOfRangeTest,
    testing::Values(OutOfRange{"priority1", "2147483648", tooHigh},
                    OutOfRange{"priority1", "1e300", tooHigh},
                    OutOfRange{"priority2", "-2147483649", tooLow},
                    OutOfRange{"neighborPropDelayThreshold", "-1", tooLow},
                    OutOfRange{"neighborPropDelayThreshold", "4294967296", tooHigh},
                    OutOfRange{"transportSpecific", "\"zz\"", "stoi"},
                    OutOfRange{"transportSpecific", "\"\"", "stoi"},
                    OutOfRange{"transportSpecific", "null", "stoi"},
                    OutOfRange{"transportSpecific", "\"0x80000000\"", "stoi"}));

TEST_F(ProtocolConfigFailuresTest, TextThatDoesNotParseIsInvalid) {
    for (const char* const configText : {"", "{", "{\"priority1\":}"}) {
        zeerr::release(status);
        status.code = 0;
        readToFailure(configText);
        EXPECT_EQ(status.code, -52005);
        EXPECT_EQ(textOf(status), errorText("jsonErrorsInvalidJSON", "CppJson", 34));
    }
    EXPECT_TRUE(log.lines().empty());
}

TEST_F(ProtocolConfigFailuresTest, DocumentThatIsNoObjectHasNoKeys) {
    for (const char* const configText : {"[]", "[{\"priority1\":1}]", "1", "null", "\"a\""}) {
        readToFailure(configText);
        EXPECT_EQ(status.json, invalidParameter(337));
    }
    EXPECT_EQ(log.count("Key neighborPropDelayThreshold not found in protocol config for vantel"),
              5);
}

TEST_F(ProtocolConfigFailuresTest, MissingConfigFileComesBeforeMissingInterface) {
    remove("configFile");
    remove("interface");
    readToFailure();
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.json, invalidParameter(387));
    EXPECT_EQ(log.lines(),
              (Lines{{LOG_ERR, "configFile not found in protocol config for vantel"}}));
}

TEST_F(ProtocolConfigFailuresTest, MissingInterfaceIsAnError) {
    remove("interface");
    readToFailure();
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.json, invalidParameter(394));
    EXPECT_EQ(log.lines(), (Lines{{LOG_ERR, "interface not found in protocol config for vantel"}}));
}

TEST_F(ProtocolConfigFailuresTest, NullInterfaceCountsAsMissing) {
    set("interface", "null");
    readToFailure();
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.json, invalidParameter(394));
    EXPECT_EQ(log.lines(), (Lines{{LOG_ERR, "interface not found in protocol config for vantel"}}));
}

TEST_F(ProtocolConfigFailuresTest, SingleInterfaceStringIsNotAnArray) {
    set("interface", "\"eth0\"");
    readToFailure();
    EXPECT_EQ(status.code, -52004);
    EXPECT_EQ(textOf(status), errorText("jsonErrorsNotAnArray", "cJSONUtils", 83));
    EXPECT_TRUE(log.lines().empty());
}

TEST_F(ProtocolConfigFailuresTest, InterfaceThatIsNoStringStaysAPlainTypeMismatch) {
    set("interface", "[\"eth0\",1]");
    readToFailure();
    EXPECT_EQ(status.code, -52004);
    EXPECT_EQ(textOf(status), errorText("jsonErrorsTypeMismatch", "cJSONUtils", 305));
    EXPECT_TRUE(log.lines().empty());
}

TEST_F(ProtocolConfigFailuresTest, ValuesReadBeforeTheFailureStayInTheSession) {
    set("transportSpecific", "\"0x3\"");
    remove("interface");
    readToFailure();
    EXPECT_EQ(session.udsAddress, "/var/run/ptp4l_bc");
    EXPECT_EQ(session.transportSpecific, 3);
    EXPECT_EQ(session.configFile, "ptp4l_bc.conf");
}

TEST_F(ProtocolConfigFailuresTest, FailureLeavesAnExistingFileAlone) {
    writeFile("other.conf", "former");
    set("configFile", "\"other.conf\"");
    remove("interface");
    readToFailure();
    EXPECT_EQ(readFile("other.conf"), "former");
}

} // namespace
