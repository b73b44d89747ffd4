#include "tPtpMgmtNode.h"

#include <gtest/gtest.h>

#include "errors/Exception.h"
#include "support/DatagramSocket.h"
#include "support/ErrorText.h"
#include "support/Octets.h"
#include "support/TemporaryFolder.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tUdsMsgInterface.h"

using namespace zekelVantel;

namespace {

constexpr char nodePath[] = "local";
constexpr char daemonPath[] = "remote";

/// A request up to its TLV.
Octets head(const std::string& length, const std::string& sequence,
            const std::string& first = "0D") {
    return octets(first + "02" + length + "00 00 0000 0000000000000000 00000000" +
                  "0000000000000000 0001" + sequence + "04 7F" +
                  "FFFFFFFFFFFFFFFF FFFF 00 00 00 00");
}

/// What stands on the wire when the node asks, with a daemon that a test plays by hand. The
/// answers wait in the socket's queue before the node asks: it takes what comes.
class PtpMgmtNodeTest : public testing::Test {
protected:
    void SetUp() override {
        interface.open(nodePath, status);
        ASSERT_EQ(status.code, 0);
    }

    template <typename Tlv>
    void ask(tPadOctet padOctet = tPadOctet::uncounted) {
        std::vector<typename Tlv::Data> none;
        node.getFromPorts<Tlv>(interface, remoteAddress, 0, none, status, padOctet);
        EXPECT_EQ(status.code, 0);
    }

    /// The next request that the daemon received; empty when there is none.
    Octets request() {
        const auto datagram = daemon.receiveQueued();
        return datagram ? datagram->octets : Octets();
    }

    TemporaryFolder folder;
    DatagramSocket daemon{daemonPath};
    const tUdsMsgAddress remoteAddress{daemonPath};
    tUdsMsgInterface interface;
    tPtpMgmtNode node{tPtpPortIdentity(tPtpClockIdentity(), 1), 0};
    zeerr::LocalStatus status;
};

TEST_F(PtpMgmtNodeTest, RequestOfTimeStatusIs104Octets) {
    ask<tPtp4lTimeStatusMgmtTlv>();
    const Octets sent = request();
    EXPECT_EQ(sent.size(), 104U);
    EXPECT_EQ(sent, head("0068", "0000") + octets("0001 0034 C000") + Octets(50));
}

TEST_F(PtpMgmtNodeTest, RequestOfParentDataSetIs86Octets) {
    ask<tPtp4lParentDataSetMgmtTlv>();
    const Octets sent = request();
    EXPECT_EQ(sent.size(), 86U);
    EXPECT_EQ(sent, head("0056", "0000") + octets("0001 0022 2002") + Octets(32));
}

TEST_F(PtpMgmtNodeTest, RequestOfDefaultDataSetIs74Octets) {
    ask<tPtp4lDefaultDataSetMgmtTlv>();
    const Octets sent = request();
    EXPECT_EQ(sent.size(), 74U);
    EXPECT_EQ(sent, head("004A", "0000") + octets("0001 0016 2000") + Octets(20));
}

TEST_F(PtpMgmtNodeTest, RequestOfPortDataSetIs80OctetsAndCarriesPortState3) {
    ask<tPtp4lPortDataSetMgmtTlv>();
    const Octets sent = request();
    EXPECT_EQ(sent.size(), 80U);
    EXPECT_EQ(sent, head("0050", "0000") + octets("0001 001C 2004") + Octets(10) + octets("03") +
                        Octets(15));
}

TEST_F(PtpMgmtNodeTest, RequestOfPortDataSetNpIs62Octets) {
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    const Octets sent = request();
    EXPECT_EQ(sent.size(), 62U);
    EXPECT_EQ(sent, head("003E", "0000") + octets("0001 000A C002") + Octets(8));
}

TEST_F(PtpMgmtNodeTest, RequestOfPortPropertiesIs68OctetsOfWhichMessageLengthCounts67) {
    ask<tPtp4lPortPropertiesMgmtTlv>();
    const Octets sent = request();
    EXPECT_EQ(sent.size(), 68U);
    EXPECT_EQ(sent,
              head("0043", "0000") + octets("0001 0010 C004") + Octets(10) + octets("03 00 00 00"));
}

TEST_F(PtpMgmtNodeTest, CountedPadOctetChangesNothingButMessageLength) {
    ask<tPtp4lPortPropertiesMgmtTlv>(tPadOctet::counted);
    EXPECT_EQ(request(),
              head("0044", "0000") + octets("0001 0010 C004") + Octets(10) + octets("03 00 00 00"));
}

TEST_F(PtpMgmtNodeTest, CountingThePadOctetChangesNoRequestWithoutOne) {
    ask<tPtp4lPortDataSetMgmtTlv>(tPadOctet::counted);
    ask<tPtp4lPortDataSetNpMgmtTlv>(tPadOctet::counted);
    EXPECT_EQ(first(4, request()), octets("0D02 0050"));
    EXPECT_EQ(first(4, request()), octets("0D02 003E"));
}

TEST_F(PtpMgmtNodeTest, SingleAnswerExchangeSendsTheSameRequest) {
    tPtp4lTimeStatusMgmtTlv tlv;
    ASSERT_TRUE(
        daemon.sendTo(nodePath, head("0068", "0000") + octets("0001 0034 C000") + Octets(50)));
    node.getSingle(interface, remoteAddress, tlv, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(request(), head("0068", "0000") + octets("0001 0034 C000") + Octets(50));
}

TEST_F(PtpMgmtNodeTest, OneRequestIsSentForAllPorts) {
    std::vector<tPortDataSetNp> answers;
    for (int port = 0; port < 3; ++port) {
        ASSERT_TRUE(
            daemon.sendTo(nodePath, head("003E", "0000") + octets("0001 000A C002") + Octets(8)));
    }
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remoteAddress, 3, answers, status);
    EXPECT_EQ(request().size(), 62U);
    EXPECT_EQ(request(), Octets());
}

TEST_F(PtpMgmtNodeTest, EveryRequestHasTheNextSequenceId) {
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    ask<tPtp4lPortDataSetMgmtTlv>();
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    EXPECT_EQ(first(48, request()), head("003E", "0000"));
    EXPECT_EQ(first(48, request()), head("0050", "0001"));
    EXPECT_EQ(first(48, request()), head("003E", "0002"));
}

TEST_F(PtpMgmtNodeTest, The65537thRequestHasSequenceId0Again) {
    tPtpMgmtMsg message;
    for (int sent = 0; sent < 65535; ++sent) {
        node.prepareRequest(message, 62);
    }
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    EXPECT_EQ(first(48, request()), head("003E", "FFFF"));
    EXPECT_EQ(first(48, request()), head("003E", "0000"));
}

TEST_F(PtpMgmtNodeTest, FailedExchangeConsumesASequenceId) {
    tPtp4lTimeStatusMgmtTlv tlv;
    node.getSingle(interface, tUdsMsgAddress("nobody"), tlv, status);
    EXPECT_EQ(status.code, -52024);
    EXPECT_EQ(textOf(status), errorText("zeoskerr_communicationsFault", "tUdsMsgInterface", 109));
    zeerr::LocalStatus second;
    std::vector<tPortDataSetNp> none;
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remoteAddress, 0, none, second);
    EXPECT_EQ(first(48, request()), head("003E", "0001"));
}

TEST_F(PtpMgmtNodeTest, LowNibbleOfTransportSpecificStandsInEveryRequest) {
    node = tPtpMgmtNode(tPtpPortIdentity(tPtpClockIdentity(), 1), 0xF3);
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    EXPECT_EQ(first(48, request()), head("003E", "0000", "3D"));
    EXPECT_EQ(first(48, request()), head("003E", "0001", "3D"));
}

TEST_F(PtpMgmtNodeTest, SourceIsTheNodesPortIdentity) {
    node = tPtpMgmtNode(tPtpPortIdentity(tPtpClockIdentity(0x0011223344556677), 0x8899), 0);
    ask<tPtp4lPortDataSetNpMgmtTlv>();
    EXPECT_EQ(first(30, behind(20, request())),
              octets("0011223344556677 8899 0000 04 7F FFFFFFFFFFFFFFFF FFFF 00000000") +
                  octets("0001"));
}

TEST_F(PtpMgmtNodeTest, PreparingMakesAnyMessageAGetToAllPortsOfAllClocks) {
    tPtpMgmtMsg message;
    message.setActionField(2);
    message.setTargetPortIdentity(tPtpPortIdentity(tPtpClockIdentity(5), 5));
    message.setSourcePortIdentity(tPtpPortIdentity(tPtpClockIdentity(6), 6));
    message.setTransportSpecific(7);
    message.setSequenceId(8);
    node.prepareRequest(message, 0x0102);
    EXPECT_EQ(serialized(message), head("0102", "0000"));
}

TEST_F(PtpMgmtNodeTest, RequestThatDoesNotFitIsNotSent) {
    class HugeTlv : public tPtp4lPortDataSetNpMgmtTlv {
    public:
        void serialize(tMsgBuffer& buffer, zeerr::Status& result) const override {
            for (int octet = 0; octet < 1453; ++octet) {
                buffer.writeU8(0, result);
            }
        }
    };
    tMsgBuffer buffer;
    tPtpMgmtNode::sendRequest(interface, remoteAddress, buffer, tPtpMgmtMsg(), HugeTlv(), status);
    EXPECT_EQ(status.code, -52012);
    EXPECT_EQ(textOf(status), errorText("zeoskerr_endOfData", "tMsgBuffer", 102));
    EXPECT_EQ(request(), Octets());
}

TEST_F(PtpMgmtNodeTest, SendingStartsWithAClearBuffer) {
    tMsgBuffer buffer = received(Octets(1500, 0xEE));
    tPtpMgmtNode::sendRequest(interface, remoteAddress, buffer, tPtpMgmtMsg(), tPtpMgmtTlv(),
                              status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(request().size(), 54U);
}

TEST_F(PtpMgmtNodeTest, ReceivingStartsWithAClearBuffer) {
    tMsgBuffer buffer = received(Octets(1500, 0xEE));
    buffer.readU64(status);
    ASSERT_TRUE(daemon.sendTo(nodePath, head("0036", "ABCD") + octets("0001 0002 C0DE")));
    tPtpMgmtMsg message;
    tPtpMgmtTlv tlv;
    tPtpMgmtNode::receiveResponse(interface, 1000, buffer, message, tlv, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(message.sequenceId(), 0xABCD);
    EXPECT_EQ(tlv.managementId(), 0xC0DE);
    EXPECT_EQ(buffer.data()[54], 0);
}

TEST_F(PtpMgmtNodeTest, AskingOnAClosedInterfaceIsNotInitialized) {
    interface.close();
    tPtp4lTimeStatusMgmtTlv tlv;
    node.getSingle(interface, remoteAddress, tlv, status);
    EXPECT_EQ(status.code, -52010);
    EXPECT_EQ(textOf(status), errorText("zeoskerr_resourceNotInitialized", "tUdsMsgInterface", 96));
}

TEST_F(PtpMgmtNodeTest, AskingWithAnErrorSendsAndReceivesNothing) {
    ASSERT_TRUE(daemon.sendTo(nodePath, octets("01")));
    status.code = -1;
    tPtp4lTimeStatusMgmtTlv tlv;
    std::vector<tPortDataSetNp> answers;
    node.getSingle(interface, remoteAddress, tlv, status);
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remoteAddress, 1, answers, status);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(request(), Octets());
    tMsgBuffer buffer;
    zeerr::LocalStatus second;
    interface.receive(buffer, 0, second);
    EXPECT_EQ(buffer.getLength(), 1U);
}

} // namespace
