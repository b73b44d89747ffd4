#include "WakeUpBound.h"

#include <cmath>

#include "sleepLength.h"

namespace {

constexpr std::uint64_t pollTime = 1000;
constexpr int passes = 20000;
constexpr int passesUntilSettled = 1000;

} // namespace

Delays bestDelays(double intervalSeconds) {
    const auto interval = static_cast<std::uint64_t>(std::llround(intervalSeconds * 1e9));
    Delays delays;
    std::uint64_t now = interval + interval / 3;
    std::uint64_t seen = 0;
    std::uint64_t first = 0;
    for (int pass = 0; pass < passes; ++pass) {
        const std::uint64_t ingress = now / interval * interval;
        now += pollTime;
        if (pass == passesUntilSettled) {
            first = ingress;
        } else if (ingress != seen && pass > passesUntilSettled) {
            delays.seconds.push_back(static_cast<double>(now - ingress) * 1e-9);
        }
        seen = ingress;
        now += std::uint64_t{zekelVantel::sleepLength(now, ingress)} * 1000;
    }
    delays.pairsPerSync =
        static_cast<double>(delays.seconds.size()) / static_cast<double>((seen - first) / interval);
    return delays;
}
