#include "PtpMgmtNodeExchange.h"

using namespace zekelVantel;

namespace {

TEST_F(PtpMgmtNodeExchangeTest, SingleAnswerOfTheExpectedLengthIsTaken) {
    answer(timeStatusAnswer);
    const auto tlv = getSingle<tPtp4lTimeStatusMgmtTlv>(status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(tlv.masterOffset(), -42);
    EXPECT_EQ(tlv.ingressTime(), 0x1122334455667788);
    EXPECT_EQ(tlv.cumulativeScaledRateOffset(), 3);
    EXPECT_EQ(tlv.scaledLastGmPhaseChange(), -4);
    EXPECT_EQ(tlv.gmTimeBaseIndicator(), 5);
    EXPECT_EQ(tlv.gmPresent(), 1);
    EXPECT_EQ(tlv.gmIdentity().octets(), tPtpClockIdentity(0x0102030405060708).octets());
}

TEST_F(PtpMgmtNodeExchangeTest, AnswerIsMatchedByNothingButItsLength) {
    Octets stranger = timeStatusAnswer;
    stranger[30] = 0xAB; // sequenceId
    stranger[46] = 0x03; // actionField
    stranger[52] = 0x20; // managementId
    const DatagramSocket other("other");
    ASSERT_TRUE(other.sendTo("local", stranger));
    EXPECT_EQ(getSingle<tPtp4lTimeStatusMgmtTlv>(status).masterOffset(), -42);
    EXPECT_EQ(status.code, 0);
}

TEST_F(PtpMgmtNodeExchangeTest, SingleAnswerOneOctetShortEndsInTheBuffer) {
    answer(first(103, timeStatusAnswer));
    getSingle<tPtp4lTimeStatusMgmtTlv>(status);
    expectEndOfData("tMsgBuffer", 73);
}

TEST_F(PtpMgmtNodeExchangeTest, SingleAnswerOneOctetLongIsEndOfData) {
    answer(timeStatusAnswer + octets("00"));
    getSingle<tPtp4lTimeStatusMgmtTlv>(status);
    expectEndOfData("tPtpMgmtNode", 71);
}

TEST_F(PtpMgmtNodeExchangeTest, SingleAnswerThatIsReadWholeButTooShortIsEndOfData) {
    answer(portNpAnswer(1));
    getSingle<OverstatingTlv>(status);
    expectEndOfData("tPtpMgmtNode", 71);
}

TEST_F(PtpMgmtNodeExchangeTest, EmptyAnswerEndsInTheBuffer) {
    answer({});
    getSingle<tPtp4lTimeStatusMgmtTlv>(status);
    expectEndOfData("tMsgBuffer", 73);
}

TEST_F(PtpMgmtNodeExchangeTest, SingleAnswerIsTakenWithAWarning) {
    answer(timeStatusAnswer);
    status.code = 1;
    EXPECT_EQ(getSingle<tPtp4lTimeStatusMgmtTlv>(status).masterOffset(), -42);
    EXPECT_EQ(status.code, 1);
}

TEST_F(PtpMgmtNodeExchangeTest, WrongLengthReplacesAWarning) {
    answer(timeStatusAnswer + octets("00"));
    status.code = 1;
    getSingle<tPtp4lTimeStatusMgmtTlv>(status);
    expectEndOfData("tPtpMgmtNode", 71);
}

TEST_F(PtpMgmtNodeExchangeTest, LateReplyIsReadByTheNextExchangeAndDropped) {
    getSingle<tPtp4lDefaultDataSetMgmtTlv>(status);
    EXPECT_EQ(status.code, -52007);
    answer(defaultAnswer);
    answer(timeStatusAnswer);
    zeerr::LocalStatus next;
    getSingle<tPtp4lTimeStatusMgmtTlv>(next);
    expectEndOfData(next, "tMsgBuffer", 73);
    zeerr::LocalStatus last;
    EXPECT_EQ(getSingle<tPtp4lTimeStatusMgmtTlv>(last).masterOffset(), -42);
    EXPECT_EQ(last.code, 0);
    daemon.receiveQueued();
    daemon.receiveQueued();
    const auto third = daemon.receiveQueued();
    ASSERT_TRUE(third);
    EXPECT_EQ(first(2, behind(30, third->octets)), octets("0002"));
}

TEST_F(PtpMgmtNodeExchangeTest, LongerLateReplyOfAnotherKindIsDropped) {
    answer(timeStatusAnswer);
    answer(defaultAnswer);
    getSingle<tPtp4lDefaultDataSetMgmtTlv>(status);
    expectEndOfData("tPtpMgmtNode", 71);
    zeerr::LocalStatus next;
    EXPECT_EQ(getSingle<tPtp4lDefaultDataSetMgmtTlv>(next).numberPorts(), 3);
    EXPECT_EQ(next.code, 0);
}

TEST_F(PtpMgmtNodeExchangeTest, LateReplyOfTheSameKindIsTaken) {
    Octets late = defaultAnswer;
    late[57] = 9; // numberPorts
    answer(late);
    answer(defaultAnswer);
    EXPECT_EQ(getSingle<tPtp4lDefaultDataSetMgmtTlv>(status).numberPorts(), 9);
    EXPECT_EQ(status.code, 0);
}

TEST_F(PtpMgmtNodeExchangeTest, OversizeDatagramFailsASingleAnswerExchange) {
    answer(timeStatusAnswer + Octets(2000));
    getSingle<tPtp4lTimeStatusMgmtTlv>(status);
    expectEndOfData("tPtpMgmtNode", 71);
}

TEST_F(PtpMgmtNodeExchangeTest, FailureOfAReceiveIsTheExchangesResult) {
    interface.close();
    tMsgBuffer buffer;
    tPtpMgmtMsg message;
    tPtp4lTimeStatusMgmtTlv tlv;
    tPtpMgmtNode::receiveResponse(interface, 2000, buffer, message, tlv, status);
    EXPECT_EQ(status.code, -52010);
    EXPECT_EQ(textOf(status),
              errorText("zeoskerr_resourceNotInitialized", "tUdsMsgInterface", 138));
}

} // namespace
