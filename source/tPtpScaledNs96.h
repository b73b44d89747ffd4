/// @file
#pragma once

#include <cstdint>

#include "iMsgSerializable.h"

namespace zekelVantel {

/// ScaledNs, IEEE 802.1AS-2011 6.3.3.1 (linuxptp `struct ScaledNs`): 96 bits in units of 2^-16 ns.
/// All zero by default. Read all or nothing.
class tPtpScaledNs96 final : public iMsgSerializable {
public:
    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const;

    std::uint16_t nanosecondsMsb() const { return nanosecondsMsb_; }
    std::uint64_t nanosecondsLsb() const { return nanosecondsLsb_; }
    std::uint16_t fractionalNanoseconds() const { return fractionalNanoseconds_; }

    void setNanosecondsMsb(std::uint16_t value) { nanosecondsMsb_ = value; }
    void setNanosecondsLsb(std::uint64_t value) { nanosecondsLsb_ = value; }
    void setFractionalNanoseconds(std::uint16_t value) { fractionalNanoseconds_ = value; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.nanosecondsMsb_, self.nanosecondsLsb_, self.fractionalNanoseconds_);
    }

private:
    std::uint16_t nanosecondsMsb_ = 0;
    std::uint64_t nanosecondsLsb_ = 0;
    std::uint16_t fractionalNanoseconds_ = 0;
};

} // namespace zekelVantel
