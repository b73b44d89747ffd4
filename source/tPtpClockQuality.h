/// @file
#pragma once

#include <cstdint>

#include "iMsgSerializable.h"

namespace zekelVantel {

/// ClockQuality, IEEE 1588-2008 5.3.7: 4 octets. All zero by default. Read all or nothing.
class tPtpClockQuality final : public iMsgSerializable {
public:
    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const;

    std::uint8_t clockClass() const { return clockClass_; }
    std::uint8_t clockAccuracy() const { return clockAccuracy_; }
    std::uint16_t offsetScaledLogVariance() const { return offsetScaledLogVariance_; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.clockClass_, self.clockAccuracy_, self.offsetScaledLogVariance_);
    }

private:
    std::uint8_t clockClass_ = 0;
    std::uint8_t clockAccuracy_ = 0;
    std::uint16_t offsetScaledLogVariance_ = 0;
};

} // namespace zekelVantel
