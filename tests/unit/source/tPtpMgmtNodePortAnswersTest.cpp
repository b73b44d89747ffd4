#include <chrono>

#include "PtpMgmtNodeExchange.h"

using namespace zekelVantel;

namespace {

TEST_F(PtpMgmtNodeExchangeTest, AnswersOfPortsAreAppendedInTheOrderOfArrival) {
    answer(portNpAnswer(3));
    answer(portNpAnswer(1));
    answer(portNpAnswer(2));
    std::vector<tPortDataSetNp> answers(1);
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remoteAddress, 3, answers, status);
    EXPECT_EQ(status.code, 0);
    ASSERT_EQ(answers.size(), 4U);
    EXPECT_EQ(answers[0].neighborPropDelayThresh, 0U);
    EXPECT_EQ(answers[1].neighborPropDelayThresh, 3U);
    EXPECT_EQ(answers[2].neighborPropDelayThresh, 1U);
    EXPECT_EQ(answers[3].neighborPropDelayThresh, 2U);
    EXPECT_EQ(answers[3].asCapable, 1);
}

TEST_F(PtpMgmtNodeExchangeTest, CountZeroReceivesNothing) {
    answer(portNpAnswer(1));
    EXPECT_TRUE(getNp(0, status).empty());
    EXPECT_EQ(status.code, 0);
    EXPECT_TRUE(daemon.receiveQueued());
    EXPECT_EQ(queued(), portNpAnswer(1));
}

TEST_F(PtpMgmtNodeExchangeTest, NoMemoryIsTakenForPortsThatAreOnlyClaimed) {
    answer(portNpAnswer(1));
    answer(first(1, portAnswer));
    std::vector<tPortDataSetNp> answers;
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remoteAddress, 65535, answers, status);
    EXPECT_EQ(status.code, -52012);
    EXPECT_EQ(answers.size(), 1U);
    EXPECT_LE(answers.capacity(), 64U);
}

TEST_F(PtpMgmtNodeExchangeTest, PortAnswerOneOctetShortEndsInTheBuffer) {
    answer(first(79, portAnswer));
    EXPECT_EQ(countFromPorts<tPtp4lPortDataSetMgmtTlv>(1), 0U);
    expectEndOfData("tMsgBuffer", 73);
}

TEST_F(PtpMgmtNodeExchangeTest, PortAnswerOneOctetLongIsTaken) {
    answer(portAnswer + octets("00"));
    EXPECT_EQ(countFromPorts<tPtp4lPortDataSetMgmtTlv>(1), 1U);
    EXPECT_EQ(status.code, 0);
}

TEST_F(PtpMgmtNodeExchangeTest, PortAnswerThatIsReadWholeButTooShortIsEndOfData) {
    answer(portNpAnswer(1));
    answer(portNpAnswer(2));
    EXPECT_EQ(countFromPorts<OverstatingTlv>(2), 0U);
    expectEndOfData("tPtpMgmtNode", 120);
    EXPECT_EQ(queued(), portNpAnswer(2));
}

TEST_F(PtpMgmtNodeExchangeTest, PortNamesMakeTheAnswersOfAnExchangeDifferentlyLong) {
    answer(propertiesAnswer);
    answer(answerHead("0048") +
           octets("0001 0014 C004 AABBCCFFFEDDEEFF 0002 06 01 04 62633130 00"));
    answer(answerHead("0044") + octets("0001 0010 C004 AABBCCFFFEDDEEFF 0003 02 00 00 00"));
    answer(answerHead("0043") + octets("0001 000F C004 AABBCCFFFEDDEEFF 0004 02 00 00"));
    std::vector<tPortProperties> answers;
    node.getFromPorts<tPtp4lPortPropertiesMgmtTlv>(interface, remoteAddress, 4, answers, status);
    EXPECT_EQ(status.code, 0);
    ASSERT_EQ(answers.size(), 4U);
    EXPECT_EQ(answers[0].interface.text(), "bc0");
    EXPECT_EQ(answers[1].interface.text(), "bc10");
    EXPECT_EQ(answers[1].portState, 6);
    EXPECT_EQ(answers[2].interface.text(), "");
    EXPECT_EQ(answers[3].portIdentity.portNumber(), 4);
}

TEST_F(PtpMgmtNodeExchangeTest, PortPropertiesBelowTheirMinimumEndInTheBuffer) {
    answer(answerHead("0042") + octets("0001 000E C004 AABBCCFFFEDDEEFF 0001 02 00"));
    EXPECT_EQ(countFromPorts<tPtp4lPortPropertiesMgmtTlv>(1), 0U);
    expectEndOfData("tMsgBuffer", 73);
}

TEST_F(PtpMgmtNodeExchangeTest, NameThatIsCutEndsInTheBuffer) {
    answer(first(propertiesAnswer.size() - 1, propertiesAnswer));
    EXPECT_EQ(countFromPorts<tPtp4lPortPropertiesMgmtTlv>(1), 0U);
    expectEndOfData("tMsgBuffer", 73);
}

TEST_F(PtpMgmtNodeExchangeTest, ErrorEndsTheExchangeAndLeavesTheRemainingAnswers) {
    answer(portNpAnswer(1));
    answer(first(61, portNpAnswer(2)));
    answer(portNpAnswer(3));
    const auto answers = getNp(3, status);
    expectEndOfData("tMsgBuffer", 73);
    ASSERT_EQ(answers.size(), 1U);
    EXPECT_EQ(answers[0].neighborPropDelayThresh, 1U);
    EXPECT_EQ(queued(), portNpAnswer(3));
}

TEST_F(PtpMgmtNodeExchangeTest, WarningKeepsAnswersFromBeingAppendedButReceivesThem) {
    answer(portNpAnswer(1));
    answer(portNpAnswer(2));
    answer(portNpAnswer(3));
    status.code = 1;
    EXPECT_TRUE(getNp(2, status).empty());
    EXPECT_EQ(status.code, 1);
    EXPECT_EQ(queued(), portNpAnswer(3));
}

TEST_F(PtpMgmtNodeExchangeTest, OneAnswerTooFewTimesOutAfter2000Milliseconds) {
    answer(portNpAnswer(1));
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(getNp(2, status).size(), 1U);
    EXPECT_EQ(status.code, -52007);
    EXPECT_EQ(textOf(status), errorText("zeoskerr_operationTimedOut", "tUdsMsgInterface", 160));
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(2000));
}

TEST_F(PtpMgmtNodeExchangeTest, OneAnswerTooManyIsReadByTheNextExchange) {
    answer(portNpAnswer(1));
    answer(portNpAnswer(2));
    answer(portNpAnswer(3));
    EXPECT_EQ(getNp(2, status).size(), 2U);
    const auto next = getNp(1, status);
    EXPECT_EQ(status.code, 0);
    ASSERT_EQ(next.size(), 1U);
    EXPECT_EQ(next[0].neighborPropDelayThresh, 3U);
}

} // namespace
