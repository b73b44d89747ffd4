#include "tPtpMgmtMsg.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpClockIdentity;
using zekelVantel::tPtpMgmtMsg;
using zekelVantel::tPtpMsgHeader;
using zekelVantel::tPtpPortIdentity;

namespace tPtpMgmtMsgTest {

const Octets fresh = octets("0D 02 0022 00 00 0000 0000000000000000 00000000"
                            "0000000000000000 0000 0000 04 7F"
                            "0000000000000000 0000 00 00 00 00");
const Octets header = octets("12 03 0405 06 00 0000 0708090A0B0C0D0E 00000000"
                             "1112131415161718 191A 1B1C 1D 1E");
const Octets before = header + octets("2122232425262728 292A 2B 2C 2D 00");
const Octets next = octets("5B 07 8142 A3 00 0000 91A2B3C4D5E6F708 00000000"
                           "C0C1C2C3C4C5C6C7 D8E9 FAAB B7 86"
                           "E1E2E3E4E5E6E7E8 F9FA 9B AC BD 00");

TEST(PtpMgmtMsgTest, FreshMessageIsAGet) {
    const tPtpMgmtMsg message;
    const Octets wire = serialized(message);
    EXPECT_EQ(wire, fresh);
    EXPECT_EQ(wire.size(), 48U);
    EXPECT_EQ(first(4, wire), octets("0D 02 00 22"));
    EXPECT_EQ(behind(44, wire), octets("00 00 00 00"));
    EXPECT_EQ(wire.at(32), 4U);
    EXPECT_EQ(wire.at(33), 0x7FU);
}

TEST(PtpMgmtMsgTest, FreshMessageGivesItsDefaults) {
    const tPtpMgmtMsg message;
    EXPECT_EQ(message.size(), 48U);
    EXPECT_EQ(message.messageType(), 13U);
    EXPECT_EQ(message.messageLength(), 34U);
    EXPECT_EQ(message.controlField(), 4U);
    EXPECT_EQ(message.logMessageInterval(), 127);
    EXPECT_EQ(serialized(message.targetPortIdentity()), Octets(10, 0));
    EXPECT_EQ(message.startingBoundaryHops(), 0U);
    EXPECT_EQ(message.boundaryHops(), 0U);
    EXPECT_EQ(message.actionField(), 0U);
}

TEST(PtpMgmtMsgTest, FieldsAreReadInWireOrder) {
    const auto message = readFrom<tPtpMgmtMsg>(next);
    EXPECT_EQ(message.transportSpecific(), 0x5U);
    EXPECT_EQ(message.messageType(), 0xBU);
    EXPECT_EQ(message.sequenceId(), 0xFAABU);
    EXPECT_EQ(message.logMessageInterval(), -122);
    EXPECT_EQ(serialized(message.targetPortIdentity().clockIdentity()), octets("E1E2E3E4E5E6E7E8"));
    EXPECT_EQ(message.targetPortIdentity().portNumber(), 0xF9FAU);
    EXPECT_EQ(message.startingBoundaryHops(), 0x9BU);
    EXPECT_EQ(message.boundaryHops(), 0xACU);
    EXPECT_EQ(message.actionField(), 0xBDU);
    EXPECT_EQ(serialized(message), next);
    EXPECT_EQ(message.size(), 48U);
}

TEST(PtpMgmtMsgTest, WholeActionOctetIsKept) {
    Octets wire = fresh;
    wire[46] = 0xF2;
    const auto message = readFrom<tPtpMgmtMsg>(wire);
    EXPECT_EQ(message.actionField(), 0xF2U);
    EXPECT_EQ(serialized(message), wire);
}

TEST(PtpMgmtMsgTest, FlagsAndReservedOctetsAreConsumedAndDropped) {
    const Octets wire = octets("5B 37 8142 A3 FE FDFC 91A2B3C4D5E6F708 FBFAF9F8"
                               "C0C1C2C3C4C5C6C7 D8E9 FAAB B7 86"
                               "E1E2E3E4E5E6E7E8 F9FA 9B AC BD F7");
    const Octets again = serialized(readFrom<tPtpMgmtMsg>(wire));
    EXPECT_EQ(again, next);
    EXPECT_EQ(again.at(6), 0U);
    EXPECT_EQ(again.at(7), 0U);
}

TEST(PtpMgmtMsgTest, EachSetterChangesItsFieldAlone) {
    auto message = readFrom<tPtpMgmtMsg>(before);
    message.setTargetPortIdentity(tPtpPortIdentity(tPtpClockIdentity(0x8182838485868788), 0x898A));
    message.setBoundaryHops(0x8C);
    EXPECT_EQ(serialized(message), header + octets("8182838485868788 898A 2B 8C 2D 00"));
    message = readFrom<tPtpMgmtMsg>(before);
    message.setStartingBoundaryHops(0x8B);
    message.setActionField(0x8D);
    EXPECT_EQ(serialized(message), header + octets("2122232425262728 292A 8B 2C 8D 00"));
}

TEST(PtpMgmtMsgTest, AnswerOfTheRealDaemonIsRead) {
    const auto message =
        readFrom<tPtpMgmtMsg>(octets("0d 02 0050 00 00 0000 0000000000000000 00000000"
                                     "8a3d5bfffe0caf07 0002 0103 04 7f"
                                     "0000000000000000 0001 00 00 02 00"));
    EXPECT_EQ(message.messageLength(), 80U);
    EXPECT_EQ(message.sourcePortIdentity().portNumber(), 2U);
    EXPECT_EQ(message.sequenceId(), 0x0103U);
    EXPECT_EQ(message.targetPortIdentity().portNumber(), 1U);
    EXPECT_EQ(message.actionField(), 2U);
}

TEST(PtpMgmtMsgTest, SizeOfTheHeaderIsNotTheSizeOfTheMessage) {
    const tPtpMgmtMsg message;
    const tPtpMsgHeader& base = message;
    EXPECT_EQ(base.size(), 48U);
}

} // namespace tPtpMgmtMsgTest
