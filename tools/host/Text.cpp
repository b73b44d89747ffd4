#include "Text.h"

#include <system_error>

#include <fmt/format.h>

namespace vantelhost {

namespace {

bool isControl(char character) {
    const auto octet = static_cast<unsigned char>(character);
    return octet < 0x20 || octet == 0x7F;
}

} // namespace

std::string onOneLine(std::string_view text) {
    std::string line;
    line.reserve(text.size());
    for (const char character : text) {
        if (isControl(character)) {
            line += fmt::format("\\x{:02X}", static_cast<unsigned>(character));
        } else {
            line += character;
        }
    }
    return line;
}

std::string errorText(int number) {
    return std::generic_category().message(number);
}

std::string toAscii(const Json& value) {
    return value.dump(-1, ' ', true, Json::error_handler_t::replace);
}

std::string shown(const Json& value) {
    constexpr std::size_t longest = 60;
    std::string text = toAscii(value);
    if (text.size() > longest) {
        text.resize(longest);
        text += "...";
    }
    return text;
}

std::string shownMember(const Json& object, const char* key) {
    const auto found = object.find(key);
    if (found == object.end()) {
        return "?";
    }
    return found->is_string() ? found->get<std::string>() : shown(*found);
}

bool isUtf8(const std::string& text) {
    try {
        static_cast<void>(Json(text).dump());
        return true;
    } catch (const Json::type_error&) {
        return false;
    }
}

} // namespace vantelhost
