#include "Report/JsonText.h"

#include "Text.h"

namespace vantelhost {

std::string jsonText(const Json& value) {
    return value.is_string() ? value.get<std::string>() : toAscii(value);
}

std::string jsonText(const Json& object, const char* key) {
    const auto found = object.find(key);
    return found == object.end() ? "" : jsonText(*found);
}

} // namespace vantelhost
