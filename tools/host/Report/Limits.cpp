#include "Report/Limits.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <iterator>

namespace vantelhost {

namespace {

constexpr std::array<Limits, 3> classes{{
    {"class-A", 'A', 100, 50, 40, 4, 70},
    {"class-B", 'B', 70, 20, 40, 4, 70},
    {"class-C", 'C', 30, 10, 10, 2, std::nullopt},
}};

/// Times are multiples of an interval: so much more or less is the same.
constexpr double timeTolerance = 1.01;

/// @param isEnough whether that much was measured that the limit can be kept
const char* resultOf(double value, const std::optional<double>& limit, bool isEnough) {
    if (!limit) {
        return "none";
    }
    if (value > *limit) {
        return "fail";
    }
    return isEnough ? "pass" : "open";
}

bool isLongEnough(const TimeErrorFigures& figures) {
    return figures.seconds * timeTolerance >= constantTime;
}

/// Of the mean of a shorter time nothing follows.
LimitVerdict constantVerdict(const TimeErrorFigures& figures, double limit) {
    const double value = figures.constantError();
    return {"cTE", value, limit, std::nullopt,
            figures.constant ? resultOf(std::abs(value), limit, true) : "open"};
}

LimitVerdict highPassVerdict(const TimeErrorFigures& figures, const std::optional<double>& limit) {
    const auto value = figures.highPassRange;
    return {"dTE_H peak to peak", value, limit, std::nullopt,
            value ? resultOf(*value, limit, isLongEnough(figures)) : resultOf(0, limit, false)};
}

/// @param reach up to this tau there must be values, seconds
LimitVerdict worstOf(const char* quantity, const std::vector<TauValue>& values, double limit,
                     double reach) {
    LimitVerdict verdict{quantity, std::nullopt, limit, std::nullopt, "open"};
    double longest = 0;
    for (const auto& [tau, value, terms] : values) {
        if (tau > longestLimitedTau * timeTolerance) {
            break;
        }
        longest = tau;
        if (!verdict.value || value > *verdict.value) {
            verdict.value = value;
            verdict.tau = tau;
        }
    }
    if (verdict.value) {
        verdict.result = resultOf(*verdict.value, limit, longest * timeTolerance >= reach);
    }
    return verdict;
}

} // namespace

std::vector<std::string> limitNames() {
    std::vector<std::string> names;
    std::transform(classes.begin(), classes.end(), std::back_inserter(names),
                   [](const Limits& limits) { return limits.name; });
    return names;
}

const Limits* findLimits(std::string_view name) {
    const auto* found = std::find_if(classes.begin(), classes.end(),
                                     [&](const Limits& limits) { return limits.name == name; });
    return found == classes.end() ? nullptr : found;
}

std::vector<LimitVerdict> verdictsOf(const TimeErrorFigures& figures, const Limits& limits) {
    // TDEV is known for each doubled tau; the next one is beyond.
    return {{"max|TE|", figures.largest(), limits.largest, std::nullopt,
             resultOf(figures.largest(), limits.largest, isLongEnough(figures))},
            constantVerdict(figures, limits.constant),
            worstOf("dTE_L MTIE", figures.low.mtie, limits.mtie, longestLimitedTau),
            worstOf("dTE_L TDEV", figures.low.tdev, limits.tdev, longestLimitedTau / 2),
            highPassVerdict(figures, limits.highPass)};
}

} // namespace vantelhost
