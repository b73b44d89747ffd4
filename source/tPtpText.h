/// @file
#pragma once

#include <cstdint>
#include <string>

#include "iMsgSerializable.h"

namespace zekelVantel {

/// PTPText, IEEE 1588-2008 5.3.9: a length octet and as many octets of text. Empty by default. Read
/// all or nothing. A pad octet behind it belongs to whoever holds the text.
class tPtpText final : public iMsgSerializable {
public:
    static constexpr bool isVariable = true;

    /// The text is kept up to its first zero octet, the length as received.
    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;

    /// Writes the length as received, then the text that is kept.
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;

    /// One more than the length as received.
    std::uint32_t size() const { return lengthField_ + 1U; }

    std::uint8_t lengthField() const { return lengthField_; }
    std::string text() const { return text_; }

private:
    std::uint8_t lengthField_ = 0;
    std::string text_;
};

} // namespace zekelVantel
