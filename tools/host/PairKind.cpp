#include "PairKind.h"

#include <algorithm>

#include <fmt/format.h>

namespace vantelhost {

const char* leftOutWord(PairKind kind) {
    constexpr const char* words[] = {"", "1970", "no-delay", "return", "same", "jump", "health"};
    return words[static_cast<std::size_t>(kind)];
}

std::optional<PairKind> kindOfWord(std::string_view word) {
    const auto* const found =
        std::find_if(std::begin(leftOutKinds), std::end(leftOutKinds),
                     [&](PairKind kind) { return leftOutWord(kind) == word; });
    return found == std::end(leftOutKinds) ? std::nullopt : std::optional(*found);
}

std::string shownPairs(std::uint64_t all, const LeftOutCounts& leftOut) {
    std::string reasons;
    std::uint64_t sum = 0;
    for (const auto& [word, count] : leftOut) {
        reasons += fmt::format("{} {} {}", sum == 0 ? ":" : ",", word, count);
        sum += count;
    }
    return sum == 0 ? fmt::format("{}", all) : fmt::format("{}, {} left out{}", all, sum, reasons);
}

} // namespace vantelhost
