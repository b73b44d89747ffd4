/// @file
#pragma once

#include <optional>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/DatagramSocket.h"
#include "support/ErrorText.h"
#include "support/Octets.h"
#include "support/TemporaryFolder.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgInterface.h"

/// An answer of port 1 of clock AABBCC.FFFE.DDEEFF, up to its TLV.
inline Octets answerHead(const std::string& length) {
    return octets("0D02" + length + "0000 0000 0000000000000000 00000000" +
                  "AABBCCFFFEDDEEFF 0001 0000 04 7F 0000000000000000 0001 00 00 02 00");
}

inline const Octets timeStatusAnswer =
    answerHead("0068") +
    octets("0001 0034 C000 FFFFFFFFFFFFFFD6 1122334455667788 00000003 FFFFFFFC" //
           "0005 0006 0000000000000007 0008 00000001 0102030405060708");

inline const Octets defaultAnswer =
    answerHead("004A") + octets("0001 0016 2000 01 00 0003 80 F8FE FFFF 80 AABBCCFFFEDDEEFF 18 00");

/// The answer of one port: the threshold tells them apart.
inline Octets portNpAnswer(std::uint8_t threshold) {
    return answerHead("003E") + octets("0001 000A C002 000000") + Octets{threshold} +
           octets("00000001");
}

inline const Octets portAnswer =
    answerHead("0050") + octets("0001 001C 2004 AABBCCFFFEDDEEFF 0001 09 FF 0000000000010000" //
                                "01 03 FD 01 00 02");

/// Interface "bc0": no pad octet.
inline const Octets propertiesAnswer =
    answerHead("0046") + octets("0001 0012 C004 AABBCCFFFEDDEEFF 0001 09 00 03 62 63 30");

/// How answers are taken, with a daemon that a test plays by hand. The answers wait in the socket's
/// queue before the node asks: it takes what comes.
class PtpMgmtNodeExchangeTest : public testing::Test {
protected:
    void SetUp() override {
        interface.open("local", status);
        ASSERT_EQ(status.code, 0);
    }

    void answer(const Octets& octets) { ASSERT_TRUE(daemon.sendTo("local", octets)); }

    template <typename Tlv>
    Tlv getSingle(zeerr::Status& result) {
        Tlv tlv;
        node.getSingle(interface, remoteAddress, tlv, result);
        return tlv;
    }

    std::vector<zekelVantel::tPortDataSetNp> getNp(std::uint32_t count, zeerr::Status& result) {
        std::vector<zekelVantel::tPortDataSetNp> answers;
        node.getFromPorts<zekelVantel::tPtp4lPortDataSetNpMgmtTlv>(interface, remoteAddress, count,
                                                                   answers, result);
        return answers;
    }

    template <typename Tlv>
    std::size_t countFromPorts(std::uint32_t count) {
        std::vector<typename Tlv::Data> answers;
        node.getFromPorts<Tlv>(interface, remoteAddress, count, answers, status);
        return answers.size();
    }

    void expectEndOfData(const std::string& file, int line) { expectEndOfData(status, file, line); }
    static void expectEndOfData(const zeerr::Status& result, const std::string& file, int line) {
        EXPECT_EQ(result.code, -52012);
        EXPECT_EQ(textOf(result), errorText("zeoskerr_endOfData", file, line));
    }

    /// What waits for the next receive.
    std::optional<Octets> queued() {
        zekelVantel::tMsgBuffer buffer;
        zeerr::LocalStatus result;
        interface.receive(buffer, 0, result);
        return result.code == 0 ? std::optional(contentOf(buffer)) : std::nullopt;
    }

    TemporaryFolder folder;
    DatagramSocket daemon{"remote"};
    const zekelVantel::tUdsMsgAddress remoteAddress{"remote"};
    zekelVantel::tUdsMsgInterface interface;
    zekelVantel::tPtpMgmtNode node{
        zekelVantel::tPtpPortIdentity(zekelVantel::tPtpClockIdentity(), 1), 0};
    zeerr::LocalStatus status;
};

/// Says that it is one octet longer than what it reads and writes.
class OverstatingTlv : public zekelVantel::tPtp4lPortDataSetNpMgmtTlv {
public:
    std::uint32_t size() const override {
        return zekelVantel::tPtp4lPortDataSetNpMgmtTlv::size() + 1;
    }
};
