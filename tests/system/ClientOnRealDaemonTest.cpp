#include <chrono>
#include <memory>

#include <gtest/gtest.h>

#include "system/ClientReports.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgInterface.h"

using namespace zekelVantel;

namespace {

using Report = Report;
using Reports = std::vector<Report>;

/// The exchanges with linuxptp's ptp4l, beside linuxptp's own client.
class RealDaemonTest : public testing::Test {
protected:
    static void SetUpTestSuite() {
        if (BoundaryClock::isProvided()) {
            scene = std::make_unique<BoundaryClock>();
        }
    }
    static void TearDownTestSuite() { scene.reset(); }

    void SetUp() override {
        if (!scene) {
            GTEST_SKIP() << "runs in scripts/testbed.sh only";
        }
        remote = tUdsMsgAddress(scene->socket());
        zeerr::LocalStatus status;
        interface.open(scene->path("own"), status);
        ASSERT_EQ(status.code, 0);
    }

    template <typename Tlv>
    Reports getSingle() {
        Tlv tlv;
        zeerr::LocalStatus status;
        node.getSingle(interface, remote, tlv, status);
        EXPECT_EQ(status.code, 0);
        return {reportOf(tlv.data())};
    }

    template <typename Tlv>
    Reports getFromPorts(tPadOctet padOctet = tPadOctet::uncounted) {
        std::vector<typename Tlv::Data> answers;
        zeerr::LocalStatus status;
        node.getFromPorts<Tlv>(interface, remote, static_cast<std::uint32_t>(scene->ports()),
                               answers, status, padOctet);
        EXPECT_EQ(status.code, 0);
        Reports reports;
        for (const auto& answer : answers) {
            reports.push_back(reportOf(answer));
        }
        return reports;
    }

    /// Compares an exchange with what the client says, at a moment when it says the same before and
    /// after.
    template <typename Exchange>
    void expectWhatTheClientSays(const std::string& dataSet, std::size_t answers,
                                 Exchange exchange) {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
        while (std::chrono::steady_clock::now() < deadline) {
            const Reports before = scene->ask(dataSet);
            const Reports decoded = exchange();
            if (scene->ask(dataSet) == before) {
                EXPECT_EQ(decoded, before);
                EXPECT_EQ(decoded.size(), answers);
                return;
            }
        }
        FAIL() << "the daemon does not come to rest";
    }

    static std::unique_ptr<BoundaryClock> scene;

    tUdsMsgInterface interface;
    tUdsMsgAddress remote{""};
    tPtpMgmtNode node{tPtpPortIdentity(tPtpClockIdentity(), 1), 0};
};

std::unique_ptr<BoundaryClock> RealDaemonTest::scene;

TEST_F(RealDaemonTest, TimeStatusIsWhatTheClientSays) {
    const PausedGrandmaster paused;
    expectWhatTheClientSays("TIME_STATUS_NP", 1,
                            [this] { return getSingle<tPtp4lTimeStatusMgmtTlv>(); });
}

TEST_F(RealDaemonTest, TimeStatusMovesBetweenTwoOfTheClients) {
    const std::int64_t before = std::stoll(scene->ask("TIME_STATUS_NP").at(0).at("ingress_time"));
    tPtp4lTimeStatusMgmtTlv tlv;
    zeerr::LocalStatus status;
    node.getSingle(interface, remote, tlv, status);
    EXPECT_EQ(status.code, 0);
    const std::int64_t after = std::stoll(scene->ask("TIME_STATUS_NP").at(0).at("ingress_time"));
    EXPECT_LE(before, tlv.ingressTime());
    EXPECT_LE(tlv.ingressTime(), after);
}

TEST_F(RealDaemonTest, ParentDataSetIsWhatTheClientSays) {
    expectWhatTheClientSays("PARENT_DATA_SET", 1,
                            [this] { return getSingle<tPtp4lParentDataSetMgmtTlv>(); });
}

TEST_F(RealDaemonTest, DefaultDataSetIsWhatTheClientSays) {
    expectWhatTheClientSays("DEFAULT_DATA_SET", 1,
                            [this] { return getSingle<tPtp4lDefaultDataSetMgmtTlv>(); });
}

TEST_F(RealDaemonTest, PortDataSetsAreWhatTheClientSays) {
    expectWhatTheClientSays("PORT_DATA_SET", scene->ports(),
                            [this] { return getFromPorts<tPtp4lPortDataSetMgmtTlv>(); });
}

TEST_F(RealDaemonTest, PortDataSetsNpAreWhatTheClientSays) {
    expectWhatTheClientSays("PORT_DATA_SET_NP", scene->ports(),
                            [this] { return getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(); });
}

TEST_F(RealDaemonTest, PortPropertiesAskedWithTheirPadOctetCountedAreWhatTheClientSays) {
    expectWhatTheClientSays("PORT_PROPERTIES_NP", scene->ports(), [this] {
        return getFromPorts<tPtp4lPortPropertiesMgmtTlv>(tPadOctet::counted);
    });
}

// So does every linuxptp that compares messageLength with the octets received, Debian's among them.
TEST_F(RealDaemonTest, PortPropertiesAskedWithTheirPadOctetUncountedAreNotAnswered) {
    std::vector<tPortProperties> answers;
    zeerr::LocalStatus status;
    node.getFromPorts<tPtp4lPortPropertiesMgmtTlv>(interface, remote, 1, answers, status);
    EXPECT_EQ(status.code, -52007);
    EXPECT_TRUE(answers.empty());
    EXPECT_EQ(getFromPorts<tPtp4lPortPropertiesMgmtTlv>(tPadOctet::counted).size(), scene->ports());
}

TEST_F(RealDaemonTest, AllSixExchangesFollowOneAnotherOnOneSocket) {
    for (int poll = 0; poll < 20; ++poll) {
        getSingle<tPtp4lTimeStatusMgmtTlv>();
        getSingle<tPtp4lParentDataSetMgmtTlv>();
        const Report clock = getSingle<tPtp4lDefaultDataSetMgmtTlv>().at(0);
        ASSERT_EQ(clock.at("numberPorts"), std::to_string(scene->ports()));
        ASSERT_EQ(getFromPorts<tPtp4lPortDataSetMgmtTlv>().size(), scene->ports());
        ASSERT_EQ(getFromPorts<tPtp4lPortDataSetNpMgmtTlv>().size(), scene->ports());
        const Reports properties = getFromPorts<tPtp4lPortPropertiesMgmtTlv>(tPadOctet::counted);
        ASSERT_EQ(properties.size(), scene->ports());
        ASSERT_EQ(properties.at(0).at("interface"), "bc0");
    }
}

} // namespace
