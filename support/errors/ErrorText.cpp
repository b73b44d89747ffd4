#include "errors/ErrorText.h"

#include <cstdint>
#include <cstdio>
#include <cstring>
#include <limits>

#include "errors/JsonScanner.h"

namespace zeerr {
namespace {

constexpr std::uint32_t roomForMembers = 2;
constexpr std::size_t shortEscapeSize = 2;
constexpr std::size_t longEscapeSize = 6;

/// The letter behind the backslash of a two-character escape, or 0 where there is none.
char shortEscape(char character) {
    switch (character) {
    case '"':
    case '\\':
        return character;
    case '\b':
        return 'b';
    case '\t':
        return 't';
    case '\n':
        return 'n';
    case '\f':
        return 'f';
    case '\r':
        return 'r';
    default:
        return '\0';
    }
}

bool needsLongEscape(char character) {
    const auto octet = static_cast<unsigned char>(character);
    return octet < 0x20 || octet == 0x7f;
}

std::size_t escapedSize(std::string_view text) {
    std::size_t size = 0;
    for (const char character : text) {
        if (shortEscape(character) != '\0') {
            size += shortEscapeSize;
        } else {
            size += needsLongEscape(character) ? longEscapeSize : 1;
        }
    }
    return size;
}

char* writeEscaped(char* out, std::string_view text) {
    for (const char character : text) {
        if (const char letter = shortEscape(character); letter != '\0') {
            *out++ = '\\';
            *out++ = letter;
        } else if (needsLongEscape(character)) {
            char escape[longEscapeSize + 1];
            std::snprintf(escape, sizeof(escape), "\\u%04x", static_cast<unsigned>(character));
            std::memcpy(out, escape, longEscapeSize);
            out += longEscapeSize;
        } else {
            *out++ = character;
        }
    }
    return out;
}

char* writeQuoted(char* out, std::string_view text) {
    *out++ = '"';
    out = writeEscaped(out, text);
    *out++ = '"';
    return out;
}

/// Whether nothing but blanks stands between the position and the brace that opens its object.
bool isFirstMember(const char* position) {
    while (isJsonBlank(position[-1])) {
        --position;
    }
    return position[-1] == '{' || position[-1] == '[';
}

/// Inserts a comma if needed, the key, and room for a value of `valueSize` octets.
/// @return where the value is to be written, or null.
char* insertKey(char* position, std::string_view key, std::size_t valueSize, Resizer& resizer) {
    if (position == nullptr) {
        return nullptr;
    }
    const bool first = isFirstMember(position);
    const std::size_t keySize = (first ? 0 : sizeof(',')) + escapedSize(key) + sizeof("\"\":") - 1;
    position = resizer.insert(position, keySize + valueSize);
    if (position == nullptr) {
        return nullptr;
    }
    if (!first) {
        *position++ = ',';
    }
    position = writeQuoted(position, key);
    *position++ = ':';
    return position;
}

} // namespace

char* Resizer::insert(char* position, std::size_t octets) {
    const auto offset = static_cast<std::size_t>(position - status_.json);
    const std::size_t length = textLength(status_);
    while (length + octets + 1 > status_.capacity) {
        if (!grow()) {
            return nullptr;
        }
    }
    // A resize operation of the host may have lost the text.
    if (offset > length || textLength(status_) != length) {
        return nullptr;
    }
    position = status_.json + offset;
    std::memmove(position + octets, position, length - offset + 1);
    return position;
}

bool Resizer::grow() {
    const std::uint32_t capacity = status_.capacity;
    const std::uint64_t wanted = std::uint64_t{2} * capacity - 2;
    return wanted > capacity && wanted <= std::numeric_limits<std::uint32_t>::max() &&
           resize(status_, static_cast<std::uint32_t>(wanted));
}

char* beginMembers(Status& status) {
    const std::uint32_t length = textLength(status);
    const std::uint32_t size = length == 0 ? sizeof("{}") : length + 1;
    if (!resize(status, size + roomForMembers)) {
        return nullptr;
    }
    const char* const bracket = closingBracket({status.json, textLength(status)});
    return bracket == nullptr ? nullptr : status.json + (bracket - status.json);
}

char* addString(char* position, std::string_view key, std::string_view value, Resizer& resizer) {
    position = insertKey(position, key, escapedSize(value) + sizeof("\"\"") - 1, resizer);
    return position == nullptr ? nullptr : writeQuoted(position, value);
}

char* addInt(char* position, std::string_view key, int value, Resizer& resizer) {
    char digits[64];
    const int size = std::snprintf(digits, sizeof(digits), "%i", value);
    position = insertKey(position, key, static_cast<std::size_t>(size), resizer);
    if (position == nullptr) {
        return nullptr;
    }
    std::memcpy(position, digits, static_cast<std::size_t>(size));
    return position + size;
}

char* addObject(char* position, std::string_view key, Resizer& resizer) {
    position = insertKey(position, key, sizeof("{}") - 1, resizer);
    if (position == nullptr) {
        return nullptr;
    }
    position[0] = '{';
    position[1] = '}';
    return position + 1;
}

char* leaveObject(char* position) {
    return position == nullptr ? nullptr : position + 1;
}

char* addSourceLocation(char* position, std::string_view file, int line, const char* component,
                        Resizer& resizer) {
    position = addString(position, "file", file, resizer);
    position = addInt(position, "line", line, resizer);
    return component == nullptr ? position : addString(position, "component", component, resizer);
}

std::string escaped(std::string_view text) {
    std::string out(escapedSize(text), '\0');
    writeEscaped(out.data(), text);
    return out;
}

} // namespace zeerr
