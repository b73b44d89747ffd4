#include "tPtpMgmtNode.h"

#include "errors/Exception.h"

namespace zekelVantel {
namespace {

/// All ports of all clocks, IEEE 1588-2008 15.3.1.
tPtpPortIdentity allPorts() {
    return {tPtpClockIdentity(0xFFFFFFFFFFFFFFFF), 0xFFFF};
}

} // namespace

tPtpMgmtNode::tPtpMgmtNode(const tPtpPortIdentity& portIdentity, std::uint8_t transportSpecific)
    : portIdentity_(portIdentity), transportSpecific_(transportSpecific) {}

tPtpMgmtNode::~tPtpMgmtNode() = default;

void tPtpMgmtNode::prepareRequest(tPtpMgmtMsg& message, std::uint16_t messageLength) {
    message.setTransportSpecific(transportSpecific_);
    message.setMessageLength(messageLength);
    message.setSourcePortIdentity(portIdentity_);
    message.setSequenceId(sequenceId_++);
    message.setTargetPortIdentity(allPorts());
    message.setActionField(tPtpMgmtMsg::actionGet);
}

void tPtpMgmtNode::sendRequest(iMsgInterface& interface, const iMsgAddress& remoteAddress,
                               tMsgBuffer& buffer, const tPtpMgmtMsg& message,
                               const tPtpMgmtTlv& tlv, zeerr::Status& status) {
    // [oddity full-request] The request carries the whole data field: one object asks and receives.
    buffer.clear();
    message.serialize(buffer, status);
    tlv.serialize(buffer, status);
    interface.send(buffer, remoteAddress, status);
}

void tPtpMgmtNode::receiveResponse(iMsgInterface& interface, std::uint32_t timeoutMs,
                                   tMsgBuffer& buffer, tPtpMgmtMsg& message, tPtpMgmtTlv& tlv,
                                   zeerr::Status& status) {
    buffer.clear();
    interface.receive(buffer, timeoutMs, status);
    message.deserialize(buffer, status);
    tlv.deserialize(buffer, status);
}

void tPtpMgmtNode::getSingle(iMsgInterface& interface, const iMsgAddress& remoteAddress,
                             tPtpMgmtTlv& tlv, zeerr::Status& status) {
    tPtpMgmtMsg message;
    const tExchangeProbe exchange(tlv.managementId(), sequenceId_, status);
    const std::uint32_t expected = message.size() + tlv.size();
    request(interface, remoteAddress, message, tlv, tPadOctet::uncounted, status);
    receiveResponse(interface, answerTimeoutMs, buffer_, message, tlv, status);
    // [oddity length-only] The length alone decides: a late answer of the same length is as good,
    // and one of another length is dropped.
    if (!zeerr::isError(status) && buffer_.getLength() != expected) {
        zeerr::setError(status, zeerr::site::answerOfOtherLength);
    }
}

void tPtpMgmtNode::request(iMsgInterface& interface, const iMsgAddress& remoteAddress,
                           tPtpMgmtMsg& message, const tPtpMgmtTlv& tlv, tPadOctet padOctet,
                           zeerr::Status& status) {
    const std::uint32_t tlvLength =
        padOctet == tPadOctet::counted ? tlv.lengthField() + tPtpMgmtTlv::uncounted : tlv.size();
    prepareRequest(message, static_cast<std::uint16_t>(message.size() + tlvLength));
    sendRequest(interface, remoteAddress, buffer_, message, tlv, status);
}

bool tPtpMgmtNode::receiveAtLeast(std::uint32_t expected, iMsgInterface& interface,
                                  tPtpMgmtMsg& message, tPtpMgmtTlv& tlv, zeerr::Status& status) {
    receiveResponse(interface, answerTimeoutMs, buffer_, message, tlv, status);
    // [oddity minimum-length] A minimum, unlike the single answer's equality: names make the
    // answers of ports longer.
    if (!zeerr::isError(status) && buffer_.getLength() < expected) {
        zeerr::setError(status, zeerr::site::answerTooShort);
    }
    return zeerr::isClean(status);
}

} // namespace zekelVantel
