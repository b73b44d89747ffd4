#include "Report/WallClock.h"

#include <array>
#include <string_view>

#include "Report/Units.h"

namespace vantelhost {

namespace {

constexpr std::int64_t minute = 60;
constexpr std::int64_t hour = 60 * minute;
constexpr std::int64_t day = 24 * hour;

constexpr std::array<std::int64_t, 17> roundSteps{
    1,      2,          5,          10,          15,          30,
    minute, 2 * minute, 5 * minute, 10 * minute, 15 * minute, 30 * minute,
    hour,   2 * hour,   3 * hour,   6 * hour,    12 * hour};

/// As short as it can be: midnight is a date.
std::string labelOf(std::int64_t moment, std::int64_t step) {
    if (moment % day == 0) {
        return shownDate(moment).substr(std::string_view("YYYY-").size());
    }
    const auto time = shownTimeOfDay(moment);
    return step < minute ? time : time.substr(0, std::string_view("HH:MM").size());
}

} // namespace

std::int64_t roundStep(double duration, double most) {
    for (const auto step : roundSteps) {
        if (duration <= static_cast<double>(step) * most) {
            return step;
        }
    }
    auto step = day;
    while (duration > static_cast<double>(step) * most) {
        step *= 2;
    }
    return step;
}

std::vector<WallTick> wallTicks(std::uint64_t begin, double duration, std::int64_t step) {
    const auto whole = static_cast<std::int64_t>(begin / 1000000000U);
    const double part = static_cast<double>(begin % 1000000000U) * 1e-9;
    std::vector<WallTick> ticks;
    for (auto moment = whole - whole % step;; moment += step) {
        const double seconds = static_cast<double>(moment - whole) - part;
        if (seconds > duration) {
            return ticks;
        }
        if (seconds >= 0) {
            ticks.push_back({seconds, labelOf(moment, step)});
        }
    }
}

} // namespace vantelhost
