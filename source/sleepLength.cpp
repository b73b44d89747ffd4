#include "sleepLength.h"

#include <algorithm>

namespace zekelVantel {
namespace {

// [oddity passed-over-syncs] Whatever the interval of the Syncs: of more than 8 a second some are
// passed over.
constexpr std::uint32_t aimAfterSync = 128000;
constexpr std::uint32_t shortestSleep = 16000;

} // namespace

std::uint32_t sleepLength(std::uint64_t now, std::uint64_t ingressTime) {
    const auto elapsed = static_cast<std::uint32_t>((now - ingressTime) / 1000);
    // [oddity unsigned-sleep] Unsigned on purpose: when the aim has passed, or the clocks disagree,
    // there is no Sync to wait for and the long sleep is right.
    return std::clamp(aimAfterSync - elapsed, shortestSleep, longestSleep);
}

} // namespace zekelVantel
