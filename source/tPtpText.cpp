#include "tPtpText.h"

#include <algorithm>

namespace zekelVantel {

void tPtpText::deserialize(tMsgBuffer& buffer, zeerr::Status& status) {
    char text[256] = {};
    const std::uint8_t length = buffer.readU8(status);
    std::generate_n(text, length, [&] { return static_cast<char>(buffer.readU8(status)); });
    if (!zeerr::isError(status)) {
        lengthField_ = length;
        text_ = text;
    }
}

void tPtpText::serialize(tMsgBuffer& buffer, zeerr::Status& status) const {
    buffer.writeU8(lengthField_, status);
    for (const char character : text_) {
        buffer.writeU8(static_cast<std::uint8_t>(character), status);
    }
}

} // namespace zekelVantel
