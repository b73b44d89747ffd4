#include "Numbers.h"

#include <charconv>
#include <system_error>

namespace vantelhost {

namespace {

template <typename Number>
std::optional<Number> parse(std::string_view text) {
    Number value{};
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, value);
    if (result.ec != std::errc() || result.ptr != end) {
        return std::nullopt;
    }
    return value;
}

} // namespace

std::optional<std::int64_t> parseInteger(std::string_view text) {
    return parse<std::int64_t>(text);
}

std::optional<double> parseSeconds(std::string_view text) {
    const auto value = parse<double>(text);
    const bool allowed = value && *value >= 0 && *value <= 1e9;
    return allowed ? value : std::nullopt;
}

} // namespace vantelhost
