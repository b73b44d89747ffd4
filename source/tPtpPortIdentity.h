/// @file
#pragma once

#include <cstdint>

#include "tPtpClockIdentity.h"

namespace zekelVantel {

/// PortIdentity, IEEE 1588-2008 5.3.5: 10 octets. All zero by default. Read all or nothing.
class tPtpPortIdentity final : public iMsgSerializable {
public:
    tPtpPortIdentity() = default;
    tPtpPortIdentity(const tPtpClockIdentity& clockIdentity, std::uint16_t portNumber);

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const;

    const tPtpClockIdentity& clockIdentity() const { return clockIdentity_; }
    std::uint16_t portNumber() const { return portNumber_; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.clockIdentity_, self.portNumber_);
    }

private:
    tPtpClockIdentity clockIdentity_;
    std::uint16_t portNumber_ = 0;
};

} // namespace zekelVantel
