/// @file
#pragma once

#include <cstdint>

#include "tPtpMsgHeader.h"

namespace zekelVantel {

/// A management message without its TLV, IEEE 1588-2008 15.4.1: 48 octets. Read field by field.
class tPtpMgmtMsg : public tPtpMsgHeader {
public:
    /// actionField of a request for data.
    static constexpr std::uint8_t actionGet = 0;

    tPtpMgmtMsg();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const tPtpPortIdentity& targetPortIdentity() const { return body_.targetPortIdentity; }
    std::uint8_t startingBoundaryHops() const { return body_.startingBoundaryHops; }
    std::uint8_t boundaryHops() const { return body_.boundaryHops; }
    std::uint8_t actionField() const { return body_.actionField; }

    void setTargetPortIdentity(const tPtpPortIdentity& value) { body_.targetPortIdentity = value; }
    void setStartingBoundaryHops(std::uint8_t value) { body_.startingBoundaryHops = value; }
    void setBoundaryHops(std::uint8_t value) { body_.boundaryHops = value; }
    /// The whole octet is kept and written.
    void setActionField(std::uint8_t value) { body_.actionField = value; }

private:
    struct Body {
        tPtpPortIdentity targetPortIdentity;
        std::uint8_t startingBoundaryHops = 0;
        std::uint8_t boundaryHops = 0;
        std::uint8_t actionField = actionGet;

        template <typename Self, typename Visitor>
        static void visitFields(Self& self, Visitor visit) {
            visit(self.targetPortIdentity, self.startingBoundaryHops, self.boundaryHops,
                  self.actionField);
            visit.reserved(1);
        }
    };
    Body body_;
};

} // namespace zekelVantel
