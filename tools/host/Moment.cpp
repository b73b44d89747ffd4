#include "Moment.h"

#include <cmath>
#include <ctime>

namespace vantelhost {

std::uint64_t realtimeNanoseconds() {
    // Not std::chrono::system_clock: on 32 bits that of Debian 12 ends in 2038.
    timespec now{};
    static_assert(sizeof(now.tv_sec) == 8, "goes on after 2038");
    ::clock_gettime(CLOCK_REALTIME, &now);
    return static_cast<std::uint64_t>(now.tv_sec) * 1000000000U +
           static_cast<std::uint64_t>(now.tv_nsec);
}

Moment Moment::now(Clock::time_point begin) {
    return {std::chrono::duration<double>(Clock::now() - begin).count(), realtimeNanoseconds()};
}

std::uint64_t beginOf(const Moment& moment) {
    const auto microseconds = static_cast<std::uint64_t>(std::llround(moment.seconds * 1e6));
    return moment.realtime - microseconds * 1000U;
}

} // namespace vantelhost
