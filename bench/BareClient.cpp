#include "BareClient.h"

#include <stdexcept>
#include <string>

#include <sys/select.h>
#include <sys/socket.h>
#include <unistd.h>

#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"

using namespace zekelVantel;

namespace {

void check(bool holds) {
    if (!holds) {
        throw std::runtime_error("the poll of the bare client failed");
    }
}

} // namespace

BareClient::BareClient(const std::string& daemon, std::uint16_t ports)
    : Client("bare client"),
      socket_("./bareClientId." + std::to_string(getpid())),
      daemon_(daemon) {
    prepare<tPtp4lTimeStatusMgmtTlv>(1);
    prepare<tPtp4lParentDataSetMgmtTlv>(1);
    prepare<tPtp4lDefaultDataSetMgmtTlv>(1);
    prepare<tPtp4lPortDataSetMgmtTlv>(ports);
    prepare<tPtp4lPortDataSetNpMgmtTlv>(ports);
    prepare<tPtp4lPortPropertiesMgmtTlv>(ports);
}

template <typename Tlv>
void BareClient::prepare(std::uint16_t answers) {
    tPtpMgmtNode node(tPtpPortIdentity(tPtpClockIdentity(), 1), 0);
    zeerr::LocalStatus status;
    tPtpMgmtMsg message;
    tMsgBuffer buffer;
    const Tlv tlv;
    node.prepareRequest(message, static_cast<std::uint16_t>(message.size() + tlv.lengthField() +
                                                            tPtpMgmtTlv::uncounted));
    message.serialize(buffer, status);
    tlv.serialize(buffer, status);
    requests_.push_back({{buffer.data(), buffer.data() + buffer.getLength()}, answers});
}

void BareClient::poll() {
    for (const Request& request : requests_) {
        check(sendto(socket_.descriptor(), request.octets.data(), request.octets.size(), 0,
                     daemon_.sendAddress(),
                     daemon_.length()) == static_cast<ssize_t>(request.octets.size()));
        for (std::uint16_t answer = 0; answer < request.answers; ++answer) {
            receive();
        }
    }
}

void BareClient::receive() const {
    fd_set readable;
    FD_ZERO(&readable);
    FD_SET(socket_.descriptor(), &readable);
    timeval timeout{2, 0};
    check(select(socket_.descriptor() + 1, &readable, nullptr, nullptr, &timeout) == 1);
    std::uint8_t octets[1500];
    check(recvfrom(socket_.descriptor(), octets, sizeof(octets), 0, nullptr, nullptr) > 0);
}
