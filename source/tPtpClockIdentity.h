/// @file
#pragma once

#include <array>
#include <cstdint>

#include "iMsgSerializable.h"

namespace zekelVantel {

/// ClockIdentity, IEEE 1588-2008 5.3.4: 8 octets. All zero by default. Read all or nothing.
class tPtpClockIdentity final : public iMsgSerializable {
public:
    using Octets = std::array<std::uint8_t, 8>;

    tPtpClockIdentity() = default;

    /// @param value octet 0 receives bits 63 to 56, octet 7 bits 7 to 0.
    explicit tPtpClockIdentity(std::uint64_t value);

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const;

    const Octets& octets() const { return identity_; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.identity_);
    }

private:
    Octets identity_{};
};

} // namespace zekelVantel
