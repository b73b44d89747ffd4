/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "PairFilter.h"

namespace vantelhost {

/// A line of the event "pair".
struct PairLine {
    double t = 0;             ///< seconds since the host's start
    std::uint64_t time = 0;   ///< nanoseconds since 1970
    std::uint64_t local = 0;  ///< nanoseconds modulo 2^64
    std::int64_t offset = 0;  ///< nanoseconds
    std::string_view leftOut; ///< of the text: why no clock may follow it, if the host said so
    std::optional<std::uint64_t> realtime; ///< the local time's, if it is of another clock
};

/// Reads the line if it is as "run --record" writes it, to the octet: nearly all lines are, and a
/// reader of all JSON takes ten times as long.
std::optional<PairLine> parsePairLine(std::string_view text);

/// What the host judged; nothing when it did not. A pair whose only fault is the health of the
/// clock is measured.
std::optional<PairKind> judgementOf(std::string_view leftOut);

} // namespace vantelhost
