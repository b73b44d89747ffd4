/// @file
#pragma once

#include <cstdint>

#include "tPtpClockIdentity.h"
#include "tPtpClockQuality.h"
#include "tPtpMgmtTlv.h"

namespace zekelVantel {

/// IEEE 1588-2008 15.5.3.3.1 (linuxptp `struct defaultDS`): the local clock.
struct tDefaultDataSet {
    std::uint8_t flags = 0;     ///< twoStepFlag and slaveOnly, as one octet
    std::uint8_t reserved1 = 0; ///< written back as read
    std::uint16_t numberPorts = 0;
    std::uint8_t priority1 = 0;
    tPtpClockQuality clockQuality;
    std::uint8_t priority2 = 0;
    tPtpClockIdentity clockIdentity;
    std::uint8_t domainNumber = 0;
    std::uint8_t reserved2 = 0; ///< written back as read

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.flags, self.reserved1, self.numberPorts, self.priority1, self.clockQuality,
              self.priority2, self.clockIdentity, self.domainNumber, self.reserved2);
    }
};

/// DEFAULT_DATA_SET: 26 octets. Its data is read all or nothing.
class tPtp4lDefaultDataSetMgmtTlv : public tPtpMgmtTlv {
public:
    using Data = tDefaultDataSet;

    tPtp4lDefaultDataSetMgmtTlv();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const Data& data() const { return data_; }
    std::uint8_t flags() const { return data_.flags; }
    std::uint8_t reserved1() const { return data_.reserved1; }
    std::uint16_t numberPorts() const { return data_.numberPorts; }
    std::uint8_t priority1() const { return data_.priority1; }
    const tPtpClockQuality& clockQuality() const { return data_.clockQuality; }
    std::uint8_t priority2() const { return data_.priority2; }
    const tPtpClockIdentity& clockIdentity() const { return data_.clockIdentity; }
    std::uint8_t domainNumber() const { return data_.domainNumber; }
    std::uint8_t reserved2() const { return data_.reserved2; }

private:
    Data data_;
};

} // namespace zekelVantel
