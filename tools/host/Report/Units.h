/// @file
/// Times as people read them.
#pragma once

#include <cstdint>
#include <string>

namespace vantelhost {

struct Unit {
    double size; ///< in nanoseconds
    const char* name;
};

/// The unit for values up to this one, in nanoseconds: ns, µs, ms or s. Integers below 10000 ns
/// stay in ns.
Unit unitFor(double largest);

/// The unit for a long time, in seconds: s, min or h.
Unit unitForDuration(double seconds);

/// The time in its unit, with four digits.
std::string shownTime(double nanoseconds);

/// The duration in its unit, with three digits.
std::string shownDuration(double seconds);

/// The date in UTC: YYYY-MM-DD.
/// @param seconds since 1970
std::string shownDate(std::int64_t seconds);

/// The time of day in UTC: HH:MM:SS.
/// @param seconds since 1970
std::string shownTimeOfDay(std::int64_t seconds);

/// The moment in UTC, to the second.
/// @param nanoseconds since 1970
std::string shownMoment(unsigned long long nanoseconds);

} // namespace vantelhost
