#include "Fields.h"

#include <algorithm>

namespace simptp4l {

std::size_t size(const FieldList& fields) {
    std::size_t total = 0;
    for (const Field& field : fields) {
        total += field.width;
    }
    return total;
}

void encode(const FieldList& fields, Octets& octets) {
    for (const Field& field : fields) {
        for (unsigned rest = field.width; rest > 0; --rest) {
            octets.push_back(static_cast<std::uint8_t>(field.value >> (8 * (rest - 1)) & 0xFF));
        }
    }
}

void assign(FieldList& fields, std::string_view name, std::uint64_t value) {
    const auto found = std::find_if(fields.begin(), fields.end(),
                                    [name](const Field& field) { return field.name == name; });
    if (found != fields.end()) {
        found->value = value;
    }
}

void apply(const std::vector<Override>& overrides, std::string_view message, unsigned port,
           FieldList& fields) {
    for (const Override& item : overrides) {
        if (item.message == message && item.port.value_or(port) == port) {
            assign(fields, item.field, item.value);
        }
    }
}

} // namespace simptp4l
