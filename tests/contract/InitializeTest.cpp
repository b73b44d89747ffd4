#include <ostream>

#include <syslog.h>

#include <gmock/gmock.h>

#include "PluginFixture.h"

namespace {

using testing::EndsWith;
using testing::StartsWith;

class InitializeTest : public PluginFixture {
protected:
    ~InitializeTest() override {
        if (slot != &untouched) {
            plugin().finalize(&slot);
        }
    }

    void initialize(const char* protocolConfig, zeerr_Status& status) {
        EXPECT_NO_THROW(plugin().initialize(&slot, protocolConfig, &status));
    }

    int untouched = 0;
    void* slot = &untouched;
};

TEST_F(InitializeTest, GivesASessionAndWritesTheFile) {
    HostStatus status;
    initialize(configuration().c_str(), status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_NE(slot, &untouched);
    EXPECT_NE(slot, nullptr);
    const std::string file = readFile("ptp4l_bc.conf");
    EXPECT_THAT(file, StartsWith("[global]\n#\n# Default Data Set\n"));
    EXPECT_THAT(file, EndsWith("\nboundary_clock_jbod  0\n"));
    EXPECT_TRUE(log.lines().empty());
    EXPECT_TRUE(host.calls().empty());
}

TEST_F(InitializeTest, CopiesTheConfiguration) {
    std::string text = configuration();
    HostStatus status;
    initialize(text.c_str(), status);
    text.assign(text.size(), 'x');
    EXPECT_EQ(status.code, 0);
    EXPECT_NE(slot, &untouched);
}

TEST_F(InitializeTest, WritesTheFileAnewForEverySession) {
    HostStatus status;
    initialize(configuration().c_str(), status);
    plugin().finalize(&slot);
    EXPECT_NE(readFile("ptp4l_bc.conf"), "");
    writeFile("ptp4l_bc.conf", "former");
    initialize(configuration("\"priority1\":128", "\"priority1\":7").c_str(), status);
    EXPECT_THAT(readFile("ptp4l_bc.conf"), testing::HasSubstr("\npriority1               7\n"));
}

TEST_F(InitializeTest, NegativeStatusOnEntryMeansNothingHappens) {
    HostStatus status(-7, R"({"mine":1})");
    initialize(configuration().c_str(), status);
    EXPECT_EQ(slot, &untouched);
    EXPECT_EQ(status.code, -7);
    EXPECT_EQ(status.text(), R"({"mine":1})");
    EXPECT_EQ(readFile("ptp4l_bc.conf"), "");
    initialize(nullptr, status);
    EXPECT_EQ(slot, &untouched);
    EXPECT_EQ(status.code, -7);
}

TEST_F(InitializeTest, WarningOnEntryStaysOnSuccess) {
    HostStatus status(7, R"({"mine":1})");
    initialize(configuration().c_str(), status);
    EXPECT_NE(slot, &untouched);
    EXPECT_EQ(status.code, 7);
    EXPECT_EQ(status.text(), R"({"mine":1})");
}

TEST_F(InitializeTest, WarningOnEntryIsReplacedByAnError) {
    HostStatus status(7, R"({"mine":1})");
    initialize("{", status);
    EXPECT_EQ(slot, &untouched);
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.text(), R"({"error_constant":"jsonErrorsInvalidJSON","file":"CppJson",)"
                             R"("line":34,"component":"vantel_bc"})");
}

TEST_F(InitializeTest, NullConfigurationIsAnInvalidParameter) {
    HostStatus status;
    initialize(nullptr, status);
    EXPECT_EQ(slot, &untouched);
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.text(), R"({"error_constant":"zeoskerr_invalidParameter",)"
                             R"("file":"tPtp4lTimeRef","line":56,"component":"vantel_bc"})");
}

bool refusingResize(zeerr_Status*, std::uint32_t size) {
    return size == 0;
}

bool throwingResize(zeerr_Status*, std::uint32_t) {
    throw 42;
}

TEST_F(InitializeTest, CodeArrivesWithoutMemoryForTheText) {
    for (const zeerr_Resize resize : {zeerr_Resize(nullptr), &refusingResize, &throwingResize}) {
        for (const char* const text : {static_cast<const char*>(nullptr), "{", "{}"}) {
            zeerr_Status status{0, 0, resize, nullptr};
            initialize(text, status);
            EXPECT_EQ(status.code, -52005);
            EXPECT_EQ(status.json, nullptr);
            EXPECT_EQ(slot, &untouched);
        }
    }
}

// Room for the host's own text, and no more.
TEST_F(InitializeTest, NullConfigurationLeavesAShortTextWhereThereIsNoRoomForMore) {
    char text[] = "{}";
    zeerr_Status status{0, sizeof(text), &refusingResize, text};
    initialize(nullptr, status);
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(status.json, text);
    EXPECT_STREQ(text, "{}");
    EXPECT_EQ(slot, &untouched);
}

struct Failure {
    const char* name;
    const char* part;
    const char* replacement;
    std::int32_t code;
    const char* text;
    const char* line; ///< of the system log, or null
};

void PrintTo(const Failure& failure, std::ostream* out) {
    *out << failure.name;
}

class InitializeFailureTest : public InitializeTest, public testing::WithParamInterface<Failure> {};

TEST_P(InitializeFailureTest, ReachesTheHost) {
    HostStatus status;
    initialize(configuration(GetParam().part, GetParam().replacement).c_str(), status);
    EXPECT_EQ(slot, &untouched);
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(status.text(), GetParam().text);
    EXPECT_EQ(readFile("ptp4l_bc.conf"), "");
    std::vector<SyslogCapture::Line> lines;
    if (GetParam().line != nullptr) {
        lines.push_back({LOG_ERR, GetParam().line});
    }
    EXPECT_EQ(log.lines(), lines);
}

const Failure failures[] = {
    {"InvalidJson", "{\"neigh", "{neigh", -52005,
     R"({"error_constant":"jsonErrorsInvalidJSON","file":"CppJson","line":34,)"
     R"("component":"vantel_bc"})",
     nullptr},
    {"MissingKey", "\"priority2\":128,", "", -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":337,)"
     R"("component":"vantel_bc"})",
     "Key priority2 not found in protocol config for vantel"},
    {"MissingConfigFile", "\"configFile\":\"ptp4l_bc.conf\",", "", -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":387,)"
     R"("component":"vantel_bc"})",
     "configFile not found in protocol config for vantel"},
    {"NullInterface", "[\"eth0\"]", "null", -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":394,)"
     R"("component":"vantel_bc"})",
     "interface not found in protocol config for vantel"},
    {"InterfaceString", "[\"eth0\"]", "\"eth0\"", -52004,
     R"({"error_constant":"jsonErrorsNotAnArray","file":"cJSONUtils","line":83,)"
     R"("component":"vantel_bc"})",
     nullptr},
    {"InterfaceNumber", "[\"eth0\"]", "[1]", -52004,
     R"({"error_constant":"jsonErrorsTypeMismatch","file":"cJSONUtils","line":305,)"
     R"("component":"vantel_bc"})",
     nullptr},
    {"Overflow", "\"priority1\":128", "\"priority1\":2147483648", -52003,
     R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
     R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
     R"("std_exception_what":"bad numeric conversion: positive overflow"})",
     nullptr},
    {"TransportSpecific", "0x0", "none", -52003,
     R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
     R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
     R"("std_exception_what":"stoi"})",
     nullptr},
};

INSTANTIATE_TEST_SUITE_P(Failures, InitializeFailureTest, testing::ValuesIn(failures),
                         [](const auto& failure) { return failure.param.name; });

TEST_F(InitializeTest, WrongTypeNamesTheKeyAndQuotesTheConfiguration) {
    HostStatus status;
    initialize(configuration("\"priority1\":128", "\"priority1\":\"128\"").c_str(), status);
    EXPECT_EQ(slot, &untouched);
    EXPECT_EQ(status.code, -52004);
    EXPECT_THAT(
        status.text(),
        StartsWith(R"({"error_constant":"errCode","file":"jsonHelperFunctions","line":50,)"
                   R"("component":"vantel_bc","zesync_debug":{"message":"Error parsing: expected )"
                   R"(data type does not match the parsed value.",)"
                   R"("JSON":"{\"neighborPropDelayThreshold\":20000000,)"));
    EXPECT_THAT(status.text(), EndsWith(R"(\"interface\":[\"eth0\"]}","key":"priority1"}})"));
}

} // namespace
