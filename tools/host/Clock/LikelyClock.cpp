#include "Clock/LikelyClock.h"

#include <algorithm>
#include <ctime>
#include <filesystem>
#include <system_error>

#include <fmt/format.h>

#include "Clock/PtpClock.h"
#include "Moment.h"

namespace vantelhost {

namespace {

constexpr std::int64_t oneSecond = 1000000000;

/// A pair is told within this time, unless the machine stood still.
constexpr std::int64_t near = 2 * oneSecond;

/// By which TAI is ahead of UTC, where the kernel has not been told.
constexpr std::int64_t usualTai = 37 * oneSecond;

std::int64_t nanosecondsOf(clockid_t clock) {
    timespec time{};
    ::clock_gettime(clock, &time);
    return time.tv_sec * oneSecond + time.tv_nsec;
}

KnownClock tai() {
    const auto realtime = static_cast<std::int64_t>(realtimeNanoseconds());
    const std::int64_t kernels = nanosecondsOf(CLOCK_TAI);
    const bool isTold = kernels - realtime >= oneSecond;
    return {"TAI", "", static_cast<std::uint64_t>(isTold ? kernels : realtime + usualTai)};
}

std::vector<std::string> devicesIn(const std::string& dev) {
    std::vector<std::string> paths;
    std::error_code error;
    for (std::filesystem::directory_iterator entry(dev, error), end; !error && entry != end;
         entry.increment(error)) {
        const std::string name = entry->path().filename();
        if (name.size() > 3 && name.compare(0, 3, "ptp") == 0 && name.back() >= '0' &&
            name.back() <= '9') {
            paths.push_back(entry->path());
        }
    }
    std::sort(paths.begin(), paths.end());
    return paths;
}

} // namespace

bool isOfClock(std::uint64_t time, std::uint64_t now) {
    const auto age = static_cast<std::int64_t>(now - time);
    return age >= -near && age <= near;
}

std::vector<KnownClock> knownClocks(const std::string& dev) {
    std::vector<KnownClock> clocks{{"CLOCK_REALTIME", "realtime", realtimeNanoseconds()}};
    for (const auto& path : devicesIn(dev)) {
        try {
            if (const auto now = PtpClock(path).now()) {
                clocks.push_back({path, path, *now});
            }
        } catch (const std::system_error&) {
            continue; // it is not known, then
        }
    }
    clocks.push_back(tai());
    clocks.push_back(
        {"CLOCK_MONOTONIC", "", static_cast<std::uint64_t>(nanosecondsOf(CLOCK_MONOTONIC))});
    return clocks;
}

std::string otherClockText(std::uint64_t local, const std::string& clock,
                           const std::vector<KnownClock>& known) {
    const auto found = std::find_if(known.begin(), known.end(), [&](const KnownClock& each) {
        return each.name != clock && isOfClock(local, each.now);
    });
    if (found == known.end()) {
        return fmt::format(
            "the local time of this pair, {} ns, is not of {}, nor of any clock that "
            "can be read here",
            local, clock);
    }
    return fmt::format("the local time of this pair is that of {}, not of {}{}", found->name, clock,
                       found->option.empty() ? "" : fmt::format(": --clock {}?", found->option));
}

} // namespace vantelhost
