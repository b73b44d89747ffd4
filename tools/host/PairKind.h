/// @file
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace vantelhost {

/// What a host makes of a time pair. All but the measured ones are left out: no clock may follow
/// them.
enum class PairKind {
    measured,
    of1970,      ///< the grandmaster has gone: the ingress time became 0, and no Sync is behind it
    falseOffset, ///< a Sync came, but no delay is known yet: the offset is that of before, 0 at
                 ///< first
    afterReturn, ///< one of the first behind those when a grandmaster has come back
    repeated,    ///< one more of many with exactly the same offset: nothing is measured any more
    jump,        ///< the offset has jumped, or the clock was stepped, and no pair confirms it yet
    unhealthy    ///< a measurement, but the health was not good
};

constexpr PairKind leftOutKinds[] = {PairKind::of1970,      PairKind::falseOffset,
                                     PairKind::afterReturn, PairKind::repeated,
                                     PairKind::jump,        PairKind::unhealthy};

/// The word for a kind that is left out, as records and metrics have it.
const char* leftOutWord(PairKind kind);

/// The kind that has this word.
std::optional<PairKind> kindOfWord(std::string_view word);

/// How many pairs were left out, by their word; without those of which there is none.
using LeftOutCounts = std::map<std::string, std::uint64_t>;

/// So many pairs, as people read them: "715, 3 left out: jump 1, no-delay 2".
std::string shownPairs(std::uint64_t all, const LeftOutCounts& leftOut);

} // namespace vantelhost
