#include "Report/Units.h"

#include <array>
#include <cmath>
#include <ctime>

#include <fmt/format.h>

namespace vantelhost {

Unit unitFor(double largest) {
    const double size = std::abs(largest);
    if (size < 1e4) {
        return {1, "ns"};
    }
    if (size < 1e6) {
        return {1e3, "µs"};
    }
    return size < 1e9 ? Unit{1e6, "ms"} : Unit{1e9, "s"};
}

Unit unitForDuration(double seconds) {
    if (seconds < 300) {
        return {1e9, "s"};
    }
    return seconds < 3 * 3600 ? Unit{60e9, "min"} : Unit{3600e9, "h"};
}

std::string shownTime(double nanoseconds) {
    const auto unit = unitFor(nanoseconds);
    return fmt::format("{:.4g} {}", nanoseconds / unit.size, unit.name);
}

std::string shownDuration(double seconds) {
    const auto unit = unitForDuration(seconds);
    return fmt::format("{:.3g} {}", seconds * 1e9 / unit.size, unit.name);
}

std::string shownDate(std::int64_t seconds) {
    const std::time_t time = seconds;
    std::tm parts{};
    ::gmtime_r(&time, &parts);
    std::array<char, 64> text{};
    std::strftime(text.data(), text.size(), "%Y-%m-%d", &parts);
    return text.data();
}

std::string shownTimeOfDay(std::int64_t seconds) {
    return fmt::format("{:02}:{:02}:{:02}", seconds / 3600 % 24, seconds / 60 % 60, seconds % 60);
}

std::string shownMoment(unsigned long long nanoseconds) {
    const auto seconds = static_cast<std::int64_t>(nanoseconds / 1000000000U);
    return shownDate(seconds) + " " + shownTimeOfDay(seconds) + " UTC";
}

} // namespace vantelhost
