// The reference host's command "check" with a network of its own.

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "support/Child.h"
#include "system/Scene.h"

using nlohmann::json;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

namespace {

using Words = std::vector<std::string>;

class HostCheck : public testing::Test {
protected:
    void SetUp() override {
        if (sceneInterfaces().empty()) {
            GTEST_SKIP() << "SKIPPED: to be run in scripts/testbed.sh";
        }
    }

    /// The checks, by name, of settings that fit the scene.
    /// @param options more of them
    static json check(int status, const Words& options = {},
                      const std::string& udsAddress = sceneSocket()) {
        Words words{VANTEL_HOST,
                    "check",
                    "--json",
                    "--library",
                    VANTEL_BC_LIBRARY,
                    "--interface",
                    sceneInterfaces()[0],
                    "--create-fifo",
                    "--set",
                    "networkTransport=UDPv4",
                    "--set",
                    "ptpDstMac=01:1B:19:00:00:00",
                    "--set",
                    "udsAddress=" + udsAddress,
                    "--set",
                    "configFile=" + sceneVariable("TESTBED_FOLDER") + "/boundary.conf"};
        words.insert(words.end(), options.begin(), options.end());
        Child host(words);
        EXPECT_EQ(host.wait(), status);
        const json output = json::parse(host.output());
        json results = json::object();
        for (const auto& each : output["checks"]) {
            results[each["check"].get<std::string>()] = each;
        }
        return results;
    }

    static Words failed(const json& results) {
        Words names;
        for (const auto& [name, each] : results.items()) {
            if (each["result"] == "fail") {
                names.push_back(name);
            }
        }
        return names;
    }

    static void setInterface(const char* state) {
        Child ip({"/bin/ip", "link", "set", sceneInterfaces()[0], state});
        ASSERT_EQ(ip.wait(), 0) << ip.errors();
    }
};

} // namespace

TEST_F(HostCheck, OnlyTimeStampsInHardwareAreMissingOnAVeth) {
    const json results = check(1, {"--ptp4l", "/usr/sbin/ptp4l"});
    EXPECT_THAT(failed(results), ElementsAre("time stamping bc0")) << results.dump(1);
    EXPECT_THAT(results["time stamping bc0"]["found"].get<std::string>(),
                HasSubstr("missing: hardware-transmit, hardware-receive, hardware-raw-clock, "));
    EXPECT_EQ(results["interface bc0"]["result"], "ok");
    EXPECT_EQ(results["configuration"]["result"], "ok");
    EXPECT_EQ(results["capabilities"]["result"], "ok");
}

TEST_F(HostCheck, NothingIsMissingWithTheScriptForSoftware) {
    const json results = check(0);
    EXPECT_THAT(failed(results), IsEmpty()) << results.dump(1);
    EXPECT_EQ(results["time stamping bc0"]["result"], "warn");
    EXPECT_THAT(results["time stamping bc0"]["found"].get<std::string>(),
                StartsWith("in software, if ptp4l is called with -S; in hardware, missing: "));
}

TEST_F(HostCheck, TheSocketOfARunningDaemonIsInUse) {
    const json results = check(1, {}, sceneVariable("TESTBED_GRANDMASTER_UDS"));
    EXPECT_THAT(failed(results), ElementsAre("udsAddress in use"));
    EXPECT_EQ(results["other daemons"]["found"],
              "ptp4l runs already: process " + sceneVariable("TESTBED_GRANDMASTER_PID"));
}

TEST_F(HostCheck, AnInterfaceThatIsDownIsAWarning) {
    setInterface("down");
    const json results = check(0);
    setInterface("up");
    EXPECT_EQ(results["interface bc0"]["result"], "warn");
    EXPECT_EQ(results["interface bc0"]["found"], "down");
    EXPECT_EQ(results["interface bc0"]["mend"], "ip link set bc0 up");
}
