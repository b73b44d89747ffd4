#include "Clock/PtpClock.h"

#include <array>
#include <cerrno>
#include <ctime>
#include <system_error>

#include <fcntl.h>
#include <linux/ptp_clock.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace vantelhost {

namespace {

constexpr std::int64_t second = 1000000000;

/// How often the clock is read for one cross time stamp: what held one reading up seldom holds up
/// all.
constexpr unsigned readings = 5;
static_assert(readings <= PTP_MAX_SAMPLES);

/// The system's clock before and after a reading of the PTP clock.
struct Bracket {
    std::int64_t before;
    std::int64_t clock;
    std::int64_t after;

    std::int64_t width() const { return after - before; }
};

using Brackets = std::array<Bracket, readings>;

std::int64_t nanoseconds(const ptp_clock_time& time) {
    return static_cast<std::int64_t>(time.sec) * second + time.nsec;
}

CrossTime middleOf(const Bracket& bracket) {
    // Rounded up, so that it holds.
    const std::int64_t half = (bracket.width() + 1) / 2;
    return {static_cast<std::uint64_t>(bracket.clock),
            static_cast<std::uint64_t>(bracket.before + half), static_cast<std::uint64_t>(half)};
}

/// A system clock that was set meanwhile may have gone back.
std::optional<CrossTime> shortestOf(const Brackets& brackets) {
    const Bracket* shortest = nullptr;
    for (const auto& each : brackets) {
        if (each.width() >= 0 && (shortest == nullptr || each.width() < shortest->width())) {
            shortest = &each;
        }
    }
    if (shortest == nullptr) {
        errno = EAGAIN;
        return std::nullopt;
    }
    return middleOf(*shortest);
}

std::optional<CrossTime> latched(int descriptor) {
    ptp_sys_offset_precise times{};
    if (::ioctl(descriptor, PTP_SYS_OFFSET_PRECISE, &times) != 0) {
        return std::nullopt;
    }
    return CrossTime{static_cast<std::uint64_t>(nanoseconds(times.device)),
                     static_cast<std::uint64_t>(nanoseconds(times.sys_realtime)), 0};
}

std::optional<CrossTime> readByDriver(int descriptor) {
    ptp_sys_offset_extended times{};
    times.n_samples = readings;
    if (::ioctl(descriptor, PTP_SYS_OFFSET_EXTENDED, &times) != 0) {
        return std::nullopt;
    }
    Brackets brackets{};
    for (std::size_t i = 0; i < readings; ++i) {
        const auto& [before, clock, after] = times.ts[i];
        brackets.at(i) = {nanoseconds(before), nanoseconds(clock), nanoseconds(after)};
    }
    return shortestOf(brackets);
}

std::optional<CrossTime> readByKernel(int descriptor) {
    ptp_sys_offset times{};
    times.n_samples = readings;
    if (::ioctl(descriptor, PTP_SYS_OFFSET, &times) != 0) {
        return std::nullopt;
    }
    Brackets brackets{};
    for (std::size_t i = 0; i < readings; ++i) {
        const ptp_clock_time* const three = times.ts + 2 * i;
        brackets.at(i) = {nanoseconds(three[0]), nanoseconds(three[1]), nanoseconds(three[2])};
    }
    return shortestOf(brackets);
}

constexpr std::array ways{latched, readByDriver, readByKernel};

/// The dynamic clock of an open device: see clock_gettime(2).
clockid_t clockOf(int descriptor) {
    return static_cast<clockid_t>(~static_cast<unsigned>(descriptor) << 3U | 3U);
}

} // namespace

PtpClock::PtpClock(const std::string& path)
    : path_(path), descriptor_(::open(path.c_str(), O_RDONLY | O_CLOEXEC)) {
    if (descriptor_ < 0) {
        throw std::system_error(errno, std::system_category(), path);
    }
    if (!now()) {
        const int error = errno;
        ::close(descriptor_);
        throw std::system_error(error, std::system_category(), path);
    }
}

PtpClock::~PtpClock() {
    ::close(descriptor_);
}

std::optional<std::uint64_t> PtpClock::now() const {
    timespec time{};
    static_assert(sizeof(time.tv_sec) == 8, "goes on after 2038");
    if (::clock_gettime(clockOf(descriptor_), &time) != 0) {
        return std::nullopt;
    }
    return static_cast<std::uint64_t>(time.tv_sec * second + time.tv_nsec);
}

std::optional<CrossTime> PtpClock::cross() {
    int error = EOPNOTSUPP;
    for (std::size_t way = way_; way < ways.size(); ++way) {
        if (const auto time = ways.at(way)(descriptor_)) {
            return time;
        }
        error = errno;
        const bool isMissing = error == EOPNOTSUPP || error == ENOTTY;
        way_ += isMissing && way == way_ ? 1U : 0U;
    }
    errno = error;
    return std::nullopt;
}

} // namespace vantelhost
