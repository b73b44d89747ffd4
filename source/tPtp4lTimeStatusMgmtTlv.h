/// @file
#pragma once

#include <cstdint>

#include "tPtpClockIdentity.h"
#include "tPtpMgmtTlv.h"
#include "tPtpScaledNs96.h"

namespace zekelVantel {

/// linuxptp `struct time_status_np`: what the last Sync told.
struct tTimeStatus {
    std::int64_t masterOffset = 0; ///< ns
    std::int64_t ingressTime = 0;  ///< ns
    std::int32_t cumulativeScaledRateOffset = 0;
    std::int32_t scaledLastGmPhaseChange = 0;
    std::uint16_t gmTimeBaseIndicator = 0;
    tPtpScaledNs96 lastGmPhaseChange;
    std::int32_t gmPresent = 0; ///< not 0: there is a grandmaster
    tPtpClockIdentity gmIdentity;

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.masterOffset, self.ingressTime, self.cumulativeScaledRateOffset,
              self.scaledLastGmPhaseChange, self.gmTimeBaseIndicator, self.lastGmPhaseChange,
              self.gmPresent, self.gmIdentity);
    }
};

/// TIME_STATUS_NP: 56 octets. Read field by field.
class tPtp4lTimeStatusMgmtTlv : public tPtpMgmtTlv {
public:
    using Data = tTimeStatus;

    tPtp4lTimeStatusMgmtTlv();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const Data& data() const { return data_; }
    std::int64_t masterOffset() const { return data_.masterOffset; }
    std::int64_t ingressTime() const { return data_.ingressTime; }
    std::int32_t cumulativeScaledRateOffset() const { return data_.cumulativeScaledRateOffset; }
    std::int32_t scaledLastGmPhaseChange() const { return data_.scaledLastGmPhaseChange; }
    std::uint16_t gmTimeBaseIndicator() const { return data_.gmTimeBaseIndicator; }
    const tPtpScaledNs96& lastGmPhaseChange() const { return data_.lastGmPhaseChange; }
    std::int32_t gmPresent() const { return data_.gmPresent; }
    const tPtpClockIdentity& gmIdentity() const { return data_.gmIdentity; }

private:
    Data data_;
};

} // namespace zekelVantel
