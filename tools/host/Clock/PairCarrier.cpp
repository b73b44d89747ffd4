#include "Clock/PairCarrier.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>

#include <fmt/format.h>

#include "Clock/LikelyClock.h"
#include "Text.h"

namespace vantelhost {

namespace {

/// Of clocks whose rates are not known, by that of crystals.
constexpr double unknownRate = 100e-6;

/// Beyond this difference in rate one of the clocks was set: no clock is slewed faster.
constexpr double fastestRate = 0.1;

/// Between cross time stamps that tell the rate, in nanoseconds. Of nearer ones the uncertainties
/// would count many times.
constexpr std::int64_t shortestLine = 10000000;
constexpr std::int64_t longestLine = 2000000000;

/// To which two cross time stamps a straight line leads from the time `age` before the second.
struct Line {
    double rate;        ///< by which CLOCK_REALTIME is faster
    double uncertainty; ///< nanoseconds
};

std::optional<Line> lineOf(const CrossTime& last, const CrossTime& now, double age) {
    const auto length = static_cast<std::int64_t>(now.local - last.local);
    const auto gained = static_cast<std::int64_t>(now.realtime - last.realtime) - length;
    const double rate = static_cast<double>(gained) / static_cast<double>(length);
    if (length < shortestLine || length > longestLine || std::abs(rate) > fastestRate) {
        return std::nullopt;
    }
    const double part = age / static_cast<double>(length);
    return Line{rate, std::abs(1 - part) * static_cast<double>(now.uncertainty) +
                          std::abs(part) * static_cast<double>(last.uncertainty)};
}

} // namespace

void PairCarrier::begin() {
    epochOffset_ = 0;
    epochOffsetBefore_ = 0;
    last_.reset();
    refused_ = 0;
}

void PairCarrier::epochOffset(std::int64_t nanoseconds) {
    epochOffsetBefore_ = epochOffset_;
    epochOffset_ = static_cast<std::uint64_t>(nanoseconds);
}

PairCarrier::Result PairCarrier::carry(LocalClock& clock, std::uint64_t local) {
    const auto cross = clock.cross();
    if (!cross) {
        return refuse(fmt::format("{} cannot be read: {}", clock.name(), errorText(errno)));
    }
    const auto ingress = ingressOf(local, cross->local);
    if (!ingress) {
        // The name is looked for only when it is told.
        return refuse(refused_ > 0 ? "" : namer_(local - epochOffset_, clock.name()));
    }
    Result result{carriedBy(*cross, *ingress), std::nullopt};
    if (refused_ > 0) {
        result.news = clockEvent(clock.name(), "", std::exchange(refused_, 0));
    }
    return result;
}

PairCarrier::Result PairCarrier::refuse(const std::string& problem) {
    const bool isNews = refused_++ == 0;
    return {std::nullopt, isNews ? std::optional(failureEvent("clock", problem)) : std::nullopt};
}

std::optional<std::uint64_t> PairCarrier::ingressOf(std::uint64_t local, std::uint64_t now) const {
    for (const auto offset : {epochOffset_, epochOffsetBefore_}) {
        if (isOfClock(local - offset, now)) {
            return local - offset;
        }
    }
    return std::nullopt;
}

Carried PairCarrier::carriedBy(const CrossTime& cross, std::uint64_t ingress) {
    const auto age = static_cast<std::int64_t>(cross.local - ingress);
    const auto exactAge = static_cast<double>(age);
    const Line unknown{0,
                       static_cast<double>(cross.uncertainty) + std::abs(exactAge) * unknownRate};
    const Line line = last_ ? lineOf(*last_, cross, exactAge).value_or(unknown) : unknown;
    last_ = cross;
    const auto gained = static_cast<std::int64_t>(std::llround(exactAge * line.rate));
    return {cross.realtime - static_cast<std::uint64_t>(age + gained),
            static_cast<std::uint64_t>(std::llround(line.uncertainty)), false};
}

} // namespace vantelhost
