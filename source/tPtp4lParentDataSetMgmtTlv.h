/// @file
#pragma once

#include <cstdint>

#include "tPtpClockIdentity.h"
#include "tPtpClockQuality.h"
#include "tPtpMgmtTlv.h"
#include "tPtpPortIdentity.h"

namespace zekelVantel {

/// IEEE 1588-2008 15.5.3.5.1 (linuxptp `struct parentDS`): the parent and the grandmaster.
struct tParentDataSet {
    tPtpPortIdentity parentPortIdentity;
    std::uint8_t parentStats = 0;
    std::uint8_t reserved = 0; ///< written back as read
    std::uint16_t observedParentOffsetScaledLogVariance = 0;
    std::int32_t observedParentClockPhaseChangeRate = 0;
    std::uint8_t grandmasterPriority1 = 0;
    tPtpClockQuality grandmasterClockQuality;
    std::uint8_t grandmasterPriority2 = 0;
    tPtpClockIdentity grandmasterIdentity;

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.parentPortIdentity, self.parentStats, self.reserved,
              self.observedParentOffsetScaledLogVariance, self.observedParentClockPhaseChangeRate,
              self.grandmasterPriority1, self.grandmasterClockQuality, self.grandmasterPriority2,
              self.grandmasterIdentity);
    }
};

/// PARENT_DATA_SET: 38 octets. Its data is read all or nothing.
class tPtp4lParentDataSetMgmtTlv : public tPtpMgmtTlv {
public:
    using Data = tParentDataSet;

    tPtp4lParentDataSetMgmtTlv();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const Data& data() const { return data_; }
    const tPtpPortIdentity& parentPortIdentity() const { return data_.parentPortIdentity; }
    std::uint8_t parentStats() const { return data_.parentStats; }
    std::uint8_t reserved() const { return data_.reserved; }
    std::uint16_t observedParentOffsetScaledLogVariance() const {
        return data_.observedParentOffsetScaledLogVariance;
    }
    std::int32_t observedParentClockPhaseChangeRate() const {
        return data_.observedParentClockPhaseChangeRate;
    }
    std::uint8_t grandmasterPriority1() const { return data_.grandmasterPriority1; }
    const tPtpClockQuality& grandmasterClockQuality() const {
        return data_.grandmasterClockQuality;
    }
    std::uint8_t grandmasterPriority2() const { return data_.grandmasterPriority2; }
    const tPtpClockIdentity& grandmasterIdentity() const { return data_.grandmasterIdentity; }

private:
    Data data_;
};

} // namespace zekelVantel
