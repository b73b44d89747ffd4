// The reference host hands its time pairs to chronyd, which follows them without touching a clock.

#include <chrono>
#include <fstream>
#include <sstream>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "support/Child.h"
#include "support/TemporaryFolder.h"
#include "system/Scene.h"

namespace {

using Words = std::vector<std::string>;

constexpr char chronyd[] = "/usr/sbin/chronyd";
constexpr char chronyc[] = "/usr/bin/chronyc";

/// What chronyc says about the reference clock.
struct Source {
    bool reachable;
    double offset; ///< seconds; above 0 when the local clock is ahead
};

class HostWithChrony : public testing::Test {
protected:
    void SetUp() override {
        if (sceneInterfaces().empty()) {
            GTEST_SKIP() << "SKIPPED: to be run in scripts/testbed.sh";
        }
        if (::access(chronyd, X_OK) != 0 || ::access(chronyc, X_OK) != 0) {
            GTEST_SKIP() << "SKIPPED: there is no chronyd (package chrony)";
        }
        ::mkdir(path("run").c_str(), 0700); // chronyd refuses a wider one
        // Not selected: it would be followed, and its offset become 0.
        std::ofstream(path("chrony.conf"))
            << "refclock SOCK " << path("sock") << " refid PTP poll 0 filter 4 noselect\n"
            << "port 0\ncmdport 0\n"
            << "bindcmdaddress " << path("run/command") << '\n'
            << "pidfile " << path("pid") << '\n';
    }

    std::string path(const std::string& name) const { return folder_.path(name); }

    Words chronydCommand() const {
        return {chronyd, "-x", "-d", "-U", "-u", "root", "-f", path("chrony.conf")};
    }

    static Words hostCommand(const std::string& library, const Words& options) {
        Words words{VANTEL_HOST, "run", "--json", "--library", library, "--create-fifo"};
        words.insert(words.end(), options.begin(), options.end());
        return words;
    }

    std::string whatChronycSays() const {
        Child client({chronyc, "-h", path("run/command"), "-c", "-n", "sources"});
        client.wait();
        return client.output();
    }

    /// Waits for the first source that can be reached.
    Source source() const {
        const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(40);
        std::string line;
        while (std::chrono::steady_clock::now() < end) {
            line = whatChronycSays();
            std::istringstream stream(line);
            Words fields;
            for (std::string field; std::getline(stream, field, ',');) {
                fields.push_back(field);
            }
            if (fields.size() == 10 && fields[2] == "PTP" && fields[5] != "0") {
                return {true, std::stod(fields[8])};
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(100));
        }
        ADD_FAILURE() << "chronyd is not reached: " << line;
        return {};
    }

    Source sourceWithSimulatedDaemon(const std::string& offset) const {
        EXPECT_EQ(::symlink(VANTEL_SIMPTP4L, path("ptp4l").c_str()), 0);
        std::ofstream(path("ptp4l.conf.sim"))
            << "offset " << offset << "\njitter 4\nsyncs-before-delay 0\n";
        const Child clock(chronydCommand());
        const Child host(hostCommand(VANTEL_BC_TEST_LIBRARY,
                                     {"--interface", "sim0", "--fifo", path("quillEpochOffset"),
                                      "--chrony", path("sock"), "--set", "logSyncInterval=-3",
                                      "--set", "udsAddress=" + path("uds"), "--set",
                                      "configFile=" + path("ptp4l.conf")}));
        return source();
    }

private:
    const TemporaryFolder folder_; // the test's plug-in has its paths there
};

} // namespace

TEST_F(HostWithChrony, AClockFiveMillisecondsAheadIsSeenSo) {
    const Source seen = sourceWithSimulatedDaemon("5000000");
    EXPECT_TRUE(seen.reachable);
    EXPECT_NEAR(seen.offset, 0.005, 1e-8);
}

TEST_F(HostWithChrony, AClockFiveMillisecondsBehindIsSeenSo) {
    const Source seen = sourceWithSimulatedDaemon("-5000000");
    EXPECT_TRUE(seen.reachable);
    EXPECT_NEAR(seen.offset, -0.005, 1e-8);
}

TEST_F(HostWithChrony, TheRealDaemonOnOneClockGivesNoOffset) {
    const Child clock(chronydCommand());
    const Child host(hostCommand(
        VANTEL_BC_LIBRARY,
        {"--interface", sceneInterfaces()[0], "--chrony", path("sock"), "--set",
         "logSyncInterval=-3", "--set", "logAnnounceInterval=0", "--set", "networkTransport=UDPv4",
         "--set", "ptpDstMac=01:1B:19:00:00:00", "--set", "udsAddress=" + sceneSocket(), "--set",
         "configFile=" + sceneVariable("TESTBED_FOLDER") + "/boundary.conf"}));
    const Source seen = source();
    EXPECT_TRUE(seen.reachable);
    EXPECT_NEAR(seen.offset, 0, 0.001);
}
