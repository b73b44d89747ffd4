/// @file
#pragma once

#include <cstdint>

#include "tPtpMgmtTlv.h"
#include "tPtpPortIdentity.h"

namespace zekelVantel {

/// IEEE 1588-2008 15.5.3.7.1 (linuxptp `struct portDS`): the data set of one port.
struct tPortDataSet {
    tPtpPortIdentity portIdentity;
    std::uint8_t portState = 3; ///< IEEE 1588-2008 table 8
    std::int8_t logMinDelayReqInterval = 0;
    std::int64_t peerMeanPathDelay = 0; ///< TimeInterval: 2^-16 ns
    std::int8_t logAnnounceInterval = 0;
    std::uint8_t announceReceiptTimeout = 0;
    std::int8_t logSyncInterval = 0;
    std::uint8_t delayMechanism = 0;
    std::int8_t logMinPdelayReqInterval = 0;
    std::uint8_t versionNumber = 0;

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.portIdentity, self.portState, self.logMinDelayReqInterval,
              self.peerMeanPathDelay, self.logAnnounceInterval, self.announceReceiptTimeout,
              self.logSyncInterval, self.delayMechanism, self.logMinPdelayReqInterval,
              self.versionNumber);
    }
};

/// PORT_DATA_SET: 32 octets. Its data is read all or nothing.
class tPtp4lPortDataSetMgmtTlv : public tPtpMgmtTlv {
public:
    using Data = tPortDataSet;

    tPtp4lPortDataSetMgmtTlv();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const Data& data() const { return data_; }
    const tPtpPortIdentity& portIdentity() const { return data_.portIdentity; }
    std::uint8_t portState() const { return data_.portState; }
    std::int8_t logMinDelayReqInterval() const { return data_.logMinDelayReqInterval; }
    std::int64_t peerMeanPathDelay() const { return data_.peerMeanPathDelay; }
    std::int8_t logAnnounceInterval() const { return data_.logAnnounceInterval; }
    std::uint8_t announceReceiptTimeout() const { return data_.announceReceiptTimeout; }
    std::int8_t logSyncInterval() const { return data_.logSyncInterval; }
    std::uint8_t delayMechanism() const { return data_.delayMechanism; }
    std::int8_t logMinPdelayReqInterval() const { return data_.logMinPdelayReqInterval; }
    std::uint8_t versionNumber() const { return data_.versionNumber; }

private:
    Data data_;
};

} // namespace zekelVantel
