#include "RotatedName.h"

#include <charconv>

namespace vantelhost {

std::string rotatedName(const std::string& file, unsigned number) {
    return number == 0 ? file : file + "." + std::to_string(number);
}

std::pair<std::string, unsigned> rotatedName(const std::string& name) {
    const auto point = name.rfind('.');
    unsigned number = 0;
    if (point != std::string::npos) {
        std::from_chars(name.data() + point + 1, name.data() + name.size(), number);
    }
    const bool isRotated =
        number >= 1 && number <= mostRotated && name == rotatedName(name.substr(0, point), number);
    return isRotated ? std::pair(name.substr(0, point), number) : std::pair(name, 0U);
}

} // namespace vantelhost
