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

    const tPtpPortIdentity& targetPortIdentity() const { return targetPortIdentity_; }
    std::uint8_t startingBoundaryHops() const { return startingBoundaryHops_; }
    std::uint8_t boundaryHops() const { return boundaryHops_; }
    std::uint8_t actionField() const { return actionField_; }

    void setTargetPortIdentity(const tPtpPortIdentity& value) { targetPortIdentity_ = value; }
    void setStartingBoundaryHops(std::uint8_t value) { startingBoundaryHops_ = value; }
    void setBoundaryHops(std::uint8_t value) { boundaryHops_ = value; }
    /// The whole octet is kept and written.
    void setActionField(std::uint8_t value) { actionField_ = value; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        tPtpMsgHeader::visitFields(self, visit);
        visit(self.targetPortIdentity_, self.startingBoundaryHops_, self.boundaryHops_,
              self.actionField_);
        visit.reserved(1);
    }

private:
    tPtpPortIdentity targetPortIdentity_;
    std::uint8_t startingBoundaryHops_ = 0;
    std::uint8_t boundaryHops_ = 0;
    std::uint8_t actionField_ = actionGet;
};

} // namespace zekelVantel
