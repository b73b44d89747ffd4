/// @file
#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

#include "iMsgInterface.h"
#include "probes.h"
#include "tPtpMgmtMsg.h"
#include "tPtpMgmtTlv.h"

namespace zekelVantel {

/// What the messageLength of a request says about the pad octet of its TLV.
enum class tPadOctet { uncounted, counted };

/// A PTP management node, IEEE 1588-2008 clause 15, that asks ptp4l for data sets. It owns no
/// socket; interface, address and objects come with each call. Used by one thread.
///
/// An answer is told by its length alone: neither sequenceId, actionField, managementId nor sender
/// are compared. Errors are those of the interface and the buffer, and -52012 for an answer of the
/// wrong length.
class tPtpMgmtNode {
public:
    /// Time limit of every answer, in milliseconds.
    static constexpr std::uint32_t answerTimeoutMs = 2000;

    /// Ports for which room is made at once; a daemon may claim 65535.
    static constexpr std::uint32_t usualPorts = 64;

    /// @param portIdentity      stands as sourcePortIdentity in every request.
    /// @param transportSpecific likewise; the low 4 bits count.
    tPtpMgmtNode(const tPtpPortIdentity& portIdentity, std::uint8_t transportSpecific);
    virtual ~tPtpMgmtNode();

    /// Makes the message a GET to all ports of all clocks, with the next sequenceId (0 first, 0
    /// again after 65535).
    void prepareRequest(tPtpMgmtMsg& message, std::uint16_t messageLength);

    /// Sends the message and the TLV as they stand.
    static void sendRequest(iMsgInterface& interface, const iMsgAddress& remoteAddress,
                            tMsgBuffer& buffer, const tPtpMgmtMsg& message, const tPtpMgmtTlv& tlv,
                            zeerr::Status& status);

    /// Receives one datagram and reads the message and the TLV from it.
    static void receiveResponse(iMsgInterface& interface, std::uint32_t timeoutMs,
                                tMsgBuffer& buffer, tPtpMgmtMsg& message, tPtpMgmtTlv& tlv,
                                zeerr::Status& status);

    /// Single-answer exchange: asks with a fresh TLV object, which then holds the answer. The
    /// answer must have exactly the length of the request.
    void getSingle(iMsgInterface& interface, const iMsgAddress& remoteAddress, tPtpMgmtTlv& tlv,
                   zeerr::Status& status);

    /// Multi-answer exchange: asks once and receives `count` answers, whose data are appended in
    /// the order of arrival. An answer must have at least the length of a fresh request.
    template <typename Tlv>
    void getFromPorts(iMsgInterface& interface, const iMsgAddress& remoteAddress,
                      std::uint32_t count, std::vector<typename Tlv::Data>& answers,
                      zeerr::Status& status, tPadOctet padOctet = tPadOctet::uncounted);

private:
    void request(iMsgInterface& interface, const iMsgAddress& remoteAddress, tPtpMgmtMsg& message,
                 const tPtpMgmtTlv& tlv, tPadOctet padOctet, zeerr::Status& status);

    /// @return whether the answer counts: it is long enough and the status is clean.
    bool receiveAtLeast(std::uint32_t expected, iMsgInterface& interface, tPtpMgmtMsg& message,
                        tPtpMgmtTlv& tlv, zeerr::Status& status);

    tPtpPortIdentity portIdentity_;
    std::uint8_t transportSpecific_;
    std::uint16_t sequenceId_ = 0;
    tMsgBuffer buffer_; ///< of the exchange that is running
};

template <typename Tlv>
void tPtpMgmtNode::getFromPorts(iMsgInterface& interface, const iMsgAddress& remoteAddress,
                                std::uint32_t count, std::vector<typename Tlv::Data>& answers,
                                zeerr::Status& status, tPadOctet padOctet) {
    tPtpMgmtMsg message;
    Tlv tlv;
    const tExchangeProbe exchange(tlv.managementId(), sequenceId_, status);
    const std::uint32_t expected = message.size() + tlv.size();
    request(interface, remoteAddress, message, tlv, padOctet, status);
    answers.reserve(std::min(count, usualPorts));
    for (std::uint32_t answer = 0; answer < count && !zeerr::isError(status); ++answer) {
        if (receiveAtLeast(expected, interface, message, tlv, status)) {
            answers.push_back(tlv.data());
        }
    }
}

} // namespace zekelVantel
