#include "tPtpText.h"

#include <cstring>

namespace zekelVantel {

void tPtpText::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    const std::uint8_t length = buffer.readU8(status);
    if (const std::uint8_t* const octets = buffer.take(length, status)) {
        lengthField_ = length;
        const auto* const text = reinterpret_cast<const char*>(octets);
        text_.assign(text, strnlen(text, length));
    } else {
        buffer.skip(length, status);
    }
}

void tPtpText::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    buffer.writeU8(lengthField_, status);
    for (const char character : text_) {
        buffer.writeU8(static_cast<std::uint8_t>(character), status);
    }
}

} // namespace zekelVantel
