#include "Clock/RealtimeClock.h"

#include "Moment.h"

namespace vantelhost {

std::optional<std::uint64_t> RealtimeClock::now() const {
    return realtimeNanoseconds();
}

std::optional<CrossTime> RealtimeClock::cross() {
    const std::uint64_t now = realtimeNanoseconds();
    return CrossTime{now, now, 0};
}

} // namespace vantelhost
