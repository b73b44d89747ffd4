#include "support/PtpDevice.h"

#include <array>
#include <cerrno>
#include <cstdarg>
#include <ctime>
#include <fstream>
#include <optional>
#include <sstream>

#include <linux/ptp_clock.h>
#include <sys/ioctl.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

using Best = PtpDevice::Best;

constexpr std::int64_t oneSecond = 1000000000;

constexpr std::array<std::int64_t, 5> extendedWidths{5000, 900, shortestExtended, -500, 800};
constexpr std::array<std::int64_t, 5> kernelWidths{9000, shortestOfKernel, 5000, 4000, 3000};

long askSystem(clockid_t clock, timespec* time) {
#ifdef SYS_clock_gettime64 // where that without the number has 32-bit seconds
    return syscall(SYS_clock_gettime64, clock, time);
#else
    return syscall(SYS_clock_gettime, clock, time);
#endif
}

std::int64_t systemTime() {
    timespec time{};
    askSystem(CLOCK_REALTIME, &time);
    return time.tv_sec * oneSecond + time.tv_nsec;
}

std::optional<PtpDevice> deviceAt(int descriptor) {
    std::array<char, 100> text{};
    const ssize_t size = ::pread(descriptor, text.data(), text.size(), 0);
    std::istringstream words(
        std::string(text.data(), size < 0 ? 0 : static_cast<std::size_t>(size)));
    std::string kind;
    int best = 0;
    PtpDevice device;
    if (!(words >> kind >> device.ahead >> best >> device.error) || kind != "ptp") {
        return std::nullopt;
    }
    device.best = static_cast<Best>(best);
    return device;
}

ptp_clock_time toClockTime(std::int64_t time) {
    ptp_clock_time result{};
    result.sec = time / oneSecond;
    result.nsec = static_cast<unsigned>(time % oneSecond);
    return result;
}

void latch(const PtpDevice& device, ptp_sys_offset_precise& times) {
    const std::int64_t now = systemTime();
    times.device = toClockTime(now + device.ahead);
    times.sys_realtime = toClockTime(now);
}

void readExtended(const PtpDevice& device, ptp_sys_offset_extended& times) {
    std::int64_t before = systemTime();
    for (std::size_t i = 0; i < times.n_samples; ++i, before += 10000) {
        const std::int64_t width = extendedWidths.at(i);
        times.ts[i][0] = toClockTime(before);
        times.ts[i][1] = toClockTime(before + width * 3 / 10 + device.ahead);
        times.ts[i][2] = toClockTime(before + width);
    }
}

void readByKernel(const PtpDevice& device, ptp_sys_offset& times) {
    std::int64_t before = systemTime();
    for (std::size_t i = 0; i < times.n_samples; ++i) {
        const std::int64_t width = kernelWidths.at(i);
        times.ts[2 * i] = toClockTime(before);
        times.ts[2 * i + 1] = toClockTime(before + width * 3 / 10 + device.ahead);
        before += width;
        times.ts[2 * i + 2] = toClockTime(before);
    }
}

/// The way that a request stands for.
std::optional<Best> wayOf(unsigned long request) {
    switch (request) {
    case PTP_SYS_OFFSET_PRECISE:
        return Best::precise;
    case PTP_SYS_OFFSET_EXTENDED:
        return Best::extended;
    case PTP_SYS_OFFSET:
        return Best::kernel;
    default:
        return std::nullopt;
    }
}

/// @return 0 or errno.
int answer(const PtpDevice& device, Best way, void* times) {
    if (way < device.best) {
        // Of drivers, and of kernels that know no such request.
        return way == Best::precise ? EOPNOTSUPP : ENOTTY;
    }
    if (way == device.best && device.error != 0) {
        return device.error;
    }
    if (way == Best::precise) {
        latch(device, *static_cast<ptp_sys_offset_precise*>(times));
    } else if (way == Best::extended) {
        readExtended(device, *static_cast<ptp_sys_offset_extended*>(times));
    } else {
        readByKernel(device, *static_cast<ptp_sys_offset*>(times));
    }
    return 0;
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] int ioctl(int fd, unsigned long request, ...) noexcept {
    va_list arguments;
    va_start(arguments, request);
    void* const argument = va_arg(arguments, void*);
    va_end(arguments);
    const auto way = wayOf(request);
    const auto device = way ? deviceAt(fd) : std::nullopt;
    if (!device) {
        return static_cast<int>(syscall(SYS_ioctl, fd, request, argument));
    }
    const int error = answer(*device, *way, argument);
    if (error != 0) {
        errno = error;
    }
    return error == 0 ? 0 : -1;
}

[[gnu::visibility("default")]] int clock_gettime(clockid_t id, timespec* tp) noexcept {
    const auto device = id < 0 ? deviceAt(~(id >> 3)) : std::nullopt;
    if (!device) {
        return static_cast<int>(askSystem(id, tp));
    }
    const std::int64_t now = systemTime() + device->ahead;
    tp->tv_sec = now / oneSecond;
    tp->tv_nsec = static_cast<decltype(tp->tv_nsec)>(now % oneSecond);
    return 0;
}

} // extern "C"

void writePtpDevice(const std::string& path, const PtpDevice& device) {
    std::ofstream(path) << "ptp " << device.ahead << ' ' << static_cast<int>(device.best) << ' '
                        << device.error << '\n';
}
