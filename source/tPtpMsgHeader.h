/// @file
#pragma once

#include <cstdint>

#include "iMsgSerializable.h"
#include "tPtpPortIdentity.h"

namespace zekelVantel {

/// The common message header, IEEE 1588-2008 13.3: 34 octets. Read field by field. flagField and
/// the reserved octets are written as 0 and not kept.
class tPtpMsgHeader : public iMsgSerializable {
public:
    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    virtual std::uint32_t size() const;

    std::uint8_t transportSpecific() const { return transportSpecific_; }
    std::uint8_t messageType() const { return messageType_; }
    std::uint8_t versionPtp() const { return versionPtp_; }
    std::uint16_t messageLength() const { return messageLength_; }
    std::uint8_t domainNumber() const { return domainNumber_; }
    std::int64_t correctionField() const { return correctionField_; }
    const tPtpPortIdentity& sourcePortIdentity() const { return sourcePortIdentity_; }
    std::uint16_t sequenceId() const { return sequenceId_; }
    std::uint8_t controlField() const { return controlField_; }
    std::int8_t logMessageInterval() const { return logMessageInterval_; }

    /// Keeps the low 4 bits.
    void setTransportSpecific(std::uint8_t value) { transportSpecific_ = value & 0x0f; }
    /// Keeps the low 4 bits.
    void setMessageType(std::uint8_t value) { messageType_ = value & 0x0f; }
    /// Keeps the low 4 bits.
    void setVersionPtp(std::uint8_t value) { versionPtp_ = value & 0x0f; }
    void setMessageLength(std::uint16_t value) { messageLength_ = value; }
    void setDomainNumber(std::uint8_t value) { domainNumber_ = value; }
    void setCorrectionField(std::int64_t value) { correctionField_ = value; }
    void setSourcePortIdentity(const tPtpPortIdentity& value) { sourcePortIdentity_ = value; }
    void setSequenceId(std::uint16_t value) { sequenceId_ = value; }
    void setControlField(std::uint8_t value) { controlField_ = value; }
    void setLogMessageInterval(std::int8_t value) { logMessageInterval_ = value; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit.nibbles(self.transportSpecific_, self.messageType_);
        visit.lowNibble(self.versionPtp_);
        visit(self.messageLength_, self.domainNumber_);
        visit.reserved(1 + 2); // reserved, flagField
        visit(self.correctionField_);
        visit.reserved(4);
        visit(self.sourcePortIdentity_, self.sequenceId_, self.controlField_,
              self.logMessageInterval_);
    }

private:
    std::uint8_t transportSpecific_ = 0;
    std::uint8_t messageType_ = 13; // Management
    std::uint8_t versionPtp_ = 2;
    std::uint16_t messageLength_ = 34;
    std::uint8_t domainNumber_ = 0;
    std::int64_t correctionField_ = 0;
    tPtpPortIdentity sourcePortIdentity_;
    std::uint16_t sequenceId_ = 0;
    std::uint8_t controlField_ = 4; // Management
    std::int8_t logMessageInterval_ = 0;
};

} // namespace zekelVantel
