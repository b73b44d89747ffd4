// The library as it is shipped, with linuxptp's ptp4l, in the scene of scripts/testbed.sh. Each
// test takes a scene of its own, with a grandmaster that is 5 ms ahead.

#include <algorithm>
#include <cctype>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <thread>

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <unistd.h>

#include "contract/PluginFixture.h"
#include "support/Descriptors.h"
#include "support/EpochFifo.h"
#include "support/Processes.h"
#include "system/ManagementClient.h"
#include "system/Scene.h"

namespace {

using Function = RecordingHost::Function;
using Json = nlohmann::json;
using std::chrono::seconds;

/// The only child of this process, or 0.
pid_t childOfThisProcess() {
    pid_t child = 0;
    for (const auto& task : std::filesystem::directory_iterator("/proc/self/task")) {
        std::ifstream children(task.path() / "children");
        for (pid_t pid = 0; children >> pid;) {
            child = pid;
        }
    }
    return child;
}

class RealDaemon : public testing::Test {
protected:
    // The FIFO is at the place that the shipped library knows, in the scene's own /tmp.
    static void SetUpTestSuite() { std::filesystem::current_path("/tmp"); }

    ~RealDaemon() override {
        if (slot != nullptr) {
            plugin.stop(&slot);
            plugin.finalize(&slot);
        }
        endChildren();
    }

    void SetUp() override {
        HostStatus status;
        plugin.initialize(&slot, configuration().c_str(), &status);
        ASSERT_EQ(status.code, 0) << status.text();
        plugin.start(&slot, &status);
        ASSERT_EQ(status.code, 0) << status.text();
    }

    virtual std::string configuration() const { return sceneConfiguration(); }

    bool waitForQuality(const std::string& reason, bool usable, std::size_t from = 0,
                        seconds deadline = seconds(30)) const {
        return host.waitFor(
            [&](const std::vector<RecordingHost::Call>& calls) {
                return std::any_of(calls.begin() + static_cast<std::ptrdiff_t>(from), calls.end(),
                                   [&](const RecordingHost::Call& call) {
                                       return call.function == Function::setTRQuality &&
                                              call.text == reason &&
                                              (call.quality[0] > 0) == usable;
                                   });
            },
            deadline);
    }

    bool waitForPairs(std::size_t count, seconds deadline) const {
        return host.waitFor(
            [&](const std::vector<RecordingHost::Call>& calls) {
                return std::count_if(calls.begin(), calls.end(),
                                     [](const RecordingHost::Call& call) {
                                         return call.function == Function::adjustTime;
                                     }) >= static_cast<std::ptrdiff_t>(count);
            },
            deadline);
    }

    std::size_t pairs() const { return host.calls(Function::adjustTime).size(); }

    bool waitUntilFollowing() const { return waitForQuality(roleHasChanged, true); }

    /// Stops the session. @return seconds that it took.
    double stopSession() {
        const auto start = std::chrono::steady_clock::now();
        plugin.stop(&slot);
        return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    }

    void expectNothingLeft() {
        plugin.finalize(&slot);
        slot = nullptr;
        EXPECT_FALSE(hasChildren());
        waitUntil([&] { return threadCount() == threadsBefore; });
        EXPECT_EQ(threadCount(), threadsBefore);
        EXPECT_EQ(openDescriptors(), descriptorsBefore);
        EXPECT_FALSE(std::filesystem::exists("/run/ptp4lTimeRef." + std::to_string(getpid())));
    }

    static constexpr char roleHasChanged[] = "PTP role has changed.";

    const std::string socket = sceneSocket();
    const pid_t grandmaster = std::atoi(sceneVariable("TESTBED_GRANDMASTER_PID").c_str());
    const int threadsBefore = settledThreadCount();
    RecordingHost host;
    SyslogCapture log;
    const Plugin plugin;
    EpochFifo fifo;
    const int descriptorsBefore = openDescriptors();
    void* slot = nullptr;
};

/// Measures the delay to a neighbour, which the grandmaster does not.
class RealDaemonWithPeerDelay : public RealDaemon {
protected:
    std::string configuration() const override {
        Json changed = Json::parse(sceneConfiguration());
        changed["delayMechanism"] = "P2P";
        return changed.dump();
    }
};

std::int64_t offsetOf(const RecordingHost::Call& pair) {
    return static_cast<std::int64_t>(pair.localTime - pair.referenceTime);
}

/// pmc's "aabbcc.fffe.ddeeff" as the host gets it.
std::string clockIdText(const std::string& text) {
    std::string id;
    for (const char character : text) {
        if (character != '.') {
            id += id.size() % 3 == 2 ? ":" : "";
            id += static_cast<char>(std::toupper(character));
        }
    }
    return id;
}

std::string macText(const std::string& clockId) {
    return clockId.substr(0, 9) + clockId.substr(15);
}

TEST_F(RealDaemon, RunsWithItsArgumentsAloneAfterTheFirstReports) {
    const auto calls = host.calls();
    ASSERT_GE(calls.size(), 2U);
    EXPECT_EQ(calls[0].function, Function::updateMetaData);
    EXPECT_EQ(calls[1].function, Function::setTRQuality);
    EXPECT_EQ(calls[1].text, "Waiting for ptp4l status");
    const std::string process = "/proc/" + std::to_string(childOfThisProcess());
    // The scene's /usr/bin/ptp4l is a script that adds -S.
    const std::string arguments =
        "/usr/sbin/ptp4l|-S|-f|" + sceneVariable("TESTBED_FOLDER") + "/boundary.conf|-i|bc0|";
    const auto commandLine = [&] {
        std::string line = readFile(process + "/cmdline");
        std::replace(line.begin(), line.end(), '\0', '|');
        return line;
    };
    EXPECT_TRUE(waitUntil([&] { return commandLine() == arguments; })) << commandLine();
    EXPECT_EQ(readFile(process + "/environ").find("TESTBED"), std::string::npos);
}

TEST_F(RealDaemon, IsUsableWithin15SecondsOfStart) {
    EXPECT_TRUE(waitForQuality(roleHasChanged, true, 0, seconds(15)));
    EXPECT_TRUE(waitForPairs(1, seconds(5)));
}

TEST_F(RealDaemon, GivesAPairForAtLeast95PercentOfTheSyncsIn30Seconds) {
    ASSERT_TRUE(waitUntilFollowing());
    const auto received = [&] {
        return std::stol(askDaemon(socket, "PORT_STATS_NP").at(0).at("rx_Sync"));
    };
    const long syncsBefore = received();
    const std::size_t pairsBefore = pairs();
    std::this_thread::sleep_for(seconds(30));
    const long syncs = received() - syncsBefore;
    const std::size_t seen = pairs() - pairsBefore;
    RecordProperty("syncs", std::to_string(syncs));
    RecordProperty("pairs", std::to_string(seen));
    std::printf("%zu pairs of %ld Syncs\n", seen, syncs);
    EXPECT_GE(syncs, 200);
    EXPECT_GE(static_cast<double>(seen), 0.95 * static_cast<double>(syncs));
}

TEST_F(RealDaemon, OffsetIs0UntilADelayIsKnown) {
    std::vector<RecordingHost::Call> pairs;
    std::size_t before = 0;
    const auto isKnown = [&] {
        pairs = host.calls(Function::adjustTime);
        before = static_cast<std::size_t>(
            std::find_if(pairs.begin(), pairs.end(),
                         [](const RecordingHost::Call& pair) { return offsetOf(pair) != 0; }) -
            pairs.begin());
        return before < pairs.size();
    };
    ASSERT_TRUE(waitUntil(isKnown, seconds(30)));
    std::printf("%zu pairs with offset 0\n", before);
    EXPECT_NEAR(static_cast<double>(offsetOf(pairs[before])), -5e6, 1e6);
}

TEST_F(RealDaemonWithPeerDelay, GivesPairsOfOffset0AloneAndIsUsable) {
    // Six seconds: longer than it ever takes until a delay is known.
    ASSERT_TRUE(waitForPairs(48, seconds(30)));
    for (const auto& pair : host.calls(Function::adjustTime)) {
        EXPECT_EQ(offsetOf(pair), 0);
    }
    const auto quality = host.calls(Function::setTRQuality).back();
    EXPECT_EQ(quality.text, roleHasChanged);
    EXPECT_GT(quality.quality[0], 0);
}

TEST_F(RealDaemon, PortStaysUncalibratedWhileItFollows) {
    ASSERT_TRUE(waitForPairs(48, seconds(30)));
    const auto texts = host.calls(Function::updateMetaData);
    EXPECT_EQ(Json::parse(texts.back().text)["Port1"]["portState"], "PTP_UNCALIBRATED");
    for (const auto& metaData : texts) {
        EXPECT_EQ(metaData.text.find("PTP_SLAVE"), std::string::npos);
    }
}

TEST_F(RealDaemon, GrandmasterThatGoesGivesOnePairOf1970) {
    ASSERT_TRUE(waitForPairs(8, seconds(30)));
    const auto of1970 = [&] {
        const auto pairs = host.calls(Function::adjustTime);
        return std::count_if(pairs.begin(), pairs.end(),
                             [](const RecordingHost::Call& pair) { return pair.localTime == 0; });
    };
    const std::size_t before = host.calls().size();
    kill(grandmaster, SIGSTOP);
    ASSERT_TRUE(waitForQuality(roleHasChanged, false, before));
    EXPECT_TRUE(waitUntil([&] { return of1970() == 1; }));
    const std::size_t polls = host.calls(Function::getTime).size();
    EXPECT_TRUE(waitUntil([&] { return host.calls(Function::getTime).size() >= polls + 8; }));
    EXPECT_EQ(of1970(), 1);
}

TEST_F(RealDaemon, MetadataEqualsWhatTheDaemonsOwnClientPrints) {
    ASSERT_TRUE(waitUntilFollowing());
    const Report parent = askDaemon(socket, "PARENT_DATA_SET").at(0);
    const Report local = askDaemon(socket, "DEFAULT_DATA_SET").at(0);
    const std::vector<Report> ports = askDaemon(socket, "PORT_DATA_SET");
    const std::vector<Report> portsNp = askDaemon(socket, "PORT_DATA_SET_NP");
    ASSERT_EQ(ports.size(), portsNp.size());
    Json expected = {
        {"gmClockId", clockIdText(parent.at("grandmasterIdentity"))},
        {"gmMacAddress", macText(clockIdText(parent.at("grandmasterIdentity")))},
        {"localClockId", clockIdText(local.at("clockIdentity"))},
        {"clockClass", std::stoi(local.at("clockClass"))},
        {"clockAccuracy", "ACCURACY_UNKNOWN"},
        {"offsetLogVariance", std::stoi(local.at("offsetScaledLogVariance"), nullptr, 16)},
        {"priority1", std::stoi(local.at("priority1"))},
        {"priority2", std::stoi(local.at("priority2"))},
        {"domainNumber", std::stoi(local.at("domainNumber"))},
        {"gmClockClass", std::stoi(parent.at("gm.ClockClass"))},
        {"gmClockAccuracy", "ACCURACY_UNKNOWN"},
        {"gmOffsetLogVariance", std::stoi(parent.at("gm.OffsetScaledLogVariance"), nullptr, 16)},
        {"gmPriority1", std::stoi(parent.at("grandmasterPriority1"))},
        {"gmPriority2", std::stoi(parent.at("grandmasterPriority2"))},
    };
    ASSERT_EQ(local.at("clockAccuracy"), "0xfe");
    ASSERT_EQ(parent.at("gm.ClockAccuracy"), "0xfe");
    const std::vector<std::string> interfaces = sceneInterfaces();
    ASSERT_EQ(ports.size(), interfaces.size());
    for (std::size_t port = 0; port < ports.size(); ++port) {
        expected["Port" + std::to_string(port + 1)] = {
            {"portState", "PTP_" + ports[port].at("portState")},
            {"asCapable", portsNp[port].at("asCapable") != "0"},
            {"logSyncInterval", std::stoi(ports[port].at("logSyncInterval"))},
            {"logAnnounceInterval", std::stoi(ports[port].at("logAnnounceInterval"))},
            {"logPdelayInterval", std::stoi(ports[port].at("logMinPdelayReqInterval"))},
            {"interface", interfaces[port]},
            {"neighborPropDelayThreshold", std::stol(portsNp[port].at("neighborPropDelayThresh"))},
        };
    }
    const auto latest = [&] {
        return Json::parse(host.calls(Function::updateMetaData).back().text);
    };
    EXPECT_TRUE(waitUntil([&] { return latest() == expected; }))
        << "expected " << expected << "\nlast     " << latest();
}

TEST_F(RealDaemon, RoleChangesWhenTheGrandmasterFallsSilentAndWhenItReturns) {
    ASSERT_TRUE(waitUntilFollowing());
    std::size_t before = host.calls().size();
    kill(grandmaster, SIGSTOP);
    EXPECT_TRUE(waitForQuality(roleHasChanged, false, before));
    before = host.calls().size();
    kill(grandmaster, SIGCONT);
    EXPECT_TRUE(waitForQuality(roleHasChanged, true, before));
}

TEST_F(RealDaemon, DeathIsReportedOnce) {
    constexpr char hasDied[] = "PTP sub process has died unexpectedly";
    ASSERT_TRUE(waitUntilFollowing());
    kill(childOfThisProcess(), SIGKILL);
    EXPECT_TRUE(waitForQuality(hasDied, false, 0, seconds(5)));
    EXPECT_LT(stopSession(), 5.0);
    const auto calls = host.calls(Function::setTRQuality);
    EXPECT_EQ(std::count_if(calls.begin(), calls.end(),
                            [&](const RecordingHost::Call& call) { return call.text == hasDied; }),
              1);
    expectNothingLeft();
}

TEST_F(RealDaemon, PairsComeAgainWithin5SecondsAfterTheDaemonWasStoppedFor5Seconds) {
    ASSERT_TRUE(waitUntilFollowing());
    ASSERT_TRUE(waitForPairs(8, seconds(10)));
    const pid_t daemon = childOfThisProcess();
    kill(daemon, SIGSTOP);
    std::this_thread::sleep_for(seconds(5));
    const std::size_t before = pairs();
    kill(daemon, SIGCONT);
    EXPECT_TRUE(waitForPairs(before + 1, seconds(5)));
}

TEST_F(RealDaemon, StopsCleanlyRightAfterStart) {
    EXPECT_LT(stopSession(), 5.0);
    expectNothingLeft();
}

TEST_F(RealDaemon, StopsCleanlyWhileFollowing) {
    ASSERT_TRUE(waitUntilFollowing());
    EXPECT_LT(stopSession(), 3.0);
    expectNothingLeft();
}

TEST_F(RealDaemon, StopsCleanlyWhileTheGrandmasterIsSilent) {
    ASSERT_TRUE(waitUntilFollowing());
    const std::size_t before = host.calls().size();
    kill(grandmaster, SIGSTOP);
    ASSERT_TRUE(waitForQuality(roleHasChanged, false, before));
    EXPECT_LT(stopSession(), 3.0);
    expectNothingLeft();
}

// A stopped process does not take SIGTERM: the grace period of 10 s runs out.
TEST_F(RealDaemon, StopsByForceWhileTheDaemonIsStopped) {
    ASSERT_TRUE(waitUntilFollowing());
    const pid_t daemon = childOfThisProcess();
    kill(daemon, SIGSTOP);
    const double took = stopSession();
    EXPECT_GT(took, 9.0);
    EXPECT_LT(took, 17.0);
    EXPECT_EQ(
        log.count("Killing ptp4l subprocess (pid " + std::to_string(daemon) + ") using SIGKILL.x"),
        1);
    endChildren();
    expectNothingLeft();
}

TEST_F(RealDaemon, SecondSessionOfAProcessFollowsAsTheFirstDid) {
    ASSERT_TRUE(waitUntilFollowing());
    stopSession();
    plugin.finalize(&slot);
    const std::size_t before = host.calls().size();
    SetUp();
    EXPECT_TRUE(waitForQuality(roleHasChanged, true, before));
}

} // namespace
