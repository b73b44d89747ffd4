#include <gtest/gtest.h>

#include "support/FakePtp4l.h"
#include "support/TemporaryFolder.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgInterface.h"

using namespace zekelVantel;

namespace {

/// All six exchanges with a daemon in another thread. More ports than a socket's queue holds make
/// the daemon wait for the node.
class PtpMgmtNodePollTest : public testing::TestWithParam<std::uint16_t> {
protected:
    void SetUp() override { interface.open("local", status); }

    template <typename Tlv>
    std::vector<typename Tlv::Data> getFromPorts() {
        std::vector<typename Tlv::Data> answers;
        node.getFromPorts<Tlv>(interface, remote, GetParam(), answers, status);
        EXPECT_EQ(answers.size(), GetParam());
        return answers;
    }

    TemporaryFolder folder;
    FakePtp4l daemon{"remote", GetParam()};
    const tUdsMsgAddress remote{"remote"};
    tUdsMsgInterface interface;
    tPtpMgmtNode node{tPtpPortIdentity(tPtpClockIdentity(), 1), 0};
    zeerr::LocalStatus status;
};

TEST_P(PtpMgmtNodePollTest, ClockIsAskedAndAnswers) {
    tPtp4lTimeStatusMgmtTlv timeStatus;
    tPtp4lParentDataSetMgmtTlv parent;
    tPtp4lDefaultDataSetMgmtTlv defaults;
    node.getSingle(interface, remote, timeStatus, status);
    node.getSingle(interface, remote, parent, status);
    node.getSingle(interface, remote, defaults, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(timeStatus.masterOffset(), -42);
    EXPECT_EQ(parent.grandmasterPriority1(), 128);
    EXPECT_EQ(defaults.numberPorts(), GetParam());
}

TEST_P(PtpMgmtNodePollTest, EveryPortIsAskedAndAnswersInItsTurn) {
    const auto dataSets = getFromPorts<tPtp4lPortDataSetMgmtTlv>();
    const auto dataSetsNp = getFromPorts<tPtp4lPortDataSetNpMgmtTlv>();
    const auto properties = getFromPorts<tPtp4lPortPropertiesMgmtTlv>();
    ASSERT_EQ(status.code, 0);
    for (unsigned port = 1; port <= GetParam(); ++port) {
        EXPECT_EQ(dataSets[port - 1].portIdentity.portNumber(), port);
        EXPECT_EQ(dataSetsNp[port - 1].neighborPropDelayThresh, 799 + port);
        EXPECT_EQ(properties[port - 1].portIdentity.portNumber(), port);
        EXPECT_EQ(properties[port - 1].interface.text(), "swp" + std::to_string(port));
    }
}

INSTANTIATE_TEST_SUITE_P(Ports, PtpMgmtNodePollTest, testing::Values(1, 8, 64));

} // namespace
