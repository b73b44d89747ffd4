/// @file
#pragma once

#include <cstdint>

#include "iMsgSerializable.h"

namespace zekelVantel {

/// The head of a TLV, IEEE 1588-2008 14.1: 4 octets. Read field by field.
class tPtpTlv : public iMsgSerializable {
public:
    /// tlvType MANAGEMENT.
    static constexpr std::uint16_t management = 1;

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    virtual std::uint32_t size() const;

    std::uint16_t tlvType() const { return tlvType_; }

    /// Octets behind the lengthField.
    std::uint16_t lengthField() const { return lengthField_; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.tlvType_, self.lengthField_);
    }

protected:
    void setLengthField(std::uint32_t octets);

private:
    std::uint16_t tlvType_ = management;
    std::uint16_t lengthField_ = 0;
};

} // namespace zekelVantel
