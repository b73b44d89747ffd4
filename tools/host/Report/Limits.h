/// @file
/// Limits for boundary clocks: ITU-T G.8273.2/Y.1368.2 (10/2020), clause 7.1, at constant
/// temperature.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Report/TimeErrorFigures.h"

namespace vantelhost {

constexpr const char* recommendation = "ITU-T G.8273.2/Y.1368.2 (10/2020), clause 7.1";

/// MTIE and TDEV are limited up to this tau, in seconds.
constexpr double longestLimitedTau = 1000;

/// Of a class of clocks, in nanoseconds.
struct Limits {
    const char* name = ""; ///< as an option has it
    char letter = ' ';
    double largest = 0;             ///< max|TE|, unfiltered
    double constant = 0;            ///< cTE, averaged over 1000 s, to both sides
    double mtie = 0;                ///< of dTE below 0.1 Hz
    double tdev = 0;                ///< of the same
    std::optional<double> highPass; ///< dTE above 0.1 Hz, from peak to peak; for further study
};

/// The names of all classes.
std::vector<std::string> limitNames();

/// Those of this name; null if it is none of limitNames().
const Limits* findLimits(std::string_view name);

/// How a quantity keeps its limit.
struct LimitVerdict {
    const char* quantity = "";
    std::optional<double> value; ///< nanoseconds; nothing: too little was measured
    std::optional<double> limit; ///< nanoseconds; nothing: there is none
    std::optional<double> tau;   ///< where a quantity over tau is largest, seconds
    const char* result = "none"; ///< "pass", "fail", "open" (less was measured than the limit is
                                 ///< for) or "none" (there is no limit)
};

/// One for each limit, in their order above.
std::vector<LimitVerdict> verdictsOf(const TimeErrorFigures& figures, const Limits& limits);

} // namespace vantelhost
