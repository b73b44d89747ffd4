#include "TaiOffset.h"

#include <cmath>
#include <ctime>
#include <utility>

#include <fmt/format.h>

namespace vantelhost {

namespace {

double secondsOf(clockid_t clock) {
    timespec time{};
    ::clock_gettime(clock, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

bool isUtc(double ahead, std::int64_t taiOffset) {
    return std::abs(ahead) < static_cast<double>(taiOffset) / 2;
}

} // namespace

std::int64_t kernelTaiOffset() {
    const double utc = secondsOf(CLOCK_REALTIME);
    return std::llround(secondsOf(CLOCK_TAI) - utc);
}

TaiOffset::TaiOffset(std::optional<std::int64_t> seconds, std::function<std::int64_t()> kernel)
    : seconds_(seconds), kernel_(std::move(kernel)) {}

TaiOffset::Answer TaiOffset::of(std::int64_t ahead) const {
    const double seconds = static_cast<double>(ahead) * 1e-9;
    if (!seconds_) {
        return ofKernel(seconds);
    }
    return {isUtc(seconds, *seconds_) ? 0 : *seconds_, ""};
}

TaiOffset::Answer TaiOffset::ofKernel(double ahead) const {
    // What a clock may be off, where the difference is not known that tells TAI.
    constexpr std::int64_t leastDifference = 30;
    const std::int64_t known = kernel_();
    if (isUtc(ahead, known == 0 ? leastDifference : known)) {
        return {0, ""};
    }
    if (known != 0 && isUtc(ahead - static_cast<double>(known), known)) {
        return {known, ""};
    }
    const std::string difference =
        known == 0 ? "the kernel does not know TAI minus UTC"
                   : fmt::format("TAI is {} s ahead of UTC for the kernel", known);
    return {std::nullopt,
            fmt::format("the grandmaster's time is {:.3f} s ahead of this machine's, and {}: set "
                        "the clock, or say --tai-offset 37 where the grandmaster keeps TAI, 0 "
                        "where it keeps UTC",
                        ahead, difference)};
}

} // namespace vantelhost
