#include "ChronyFeed.h"

#include <utility>

namespace vantelhost {

std::optional<Event> ChronyFeed::take(std::uint64_t reference, std::uint64_t local,
                                      StampedBy stampedBy) {
    return stampedBy == StampedBy::systemClock ? clock_.take(reference, local)
                                               : takeOfPtpClock(reference, local);
}

std::optional<Event> ChronyFeed::takeOfPtpClock(std::uint64_t reference, std::uint64_t local) {
    constexpr std::uint64_t second = 1000000000;
    const auto [taken, problem] = taiOffset_.of(static_cast<std::int64_t>(reference - local));
    if (!taken) {
        return refuse(problem);
    }
    isRefusing_ = false;
    const std::uint64_t utc = reference - static_cast<std::uint64_t>(*taken) * second;
    if (!level_.take(static_cast<double>(local) * 1e-9, static_cast<std::int64_t>(local - utc))) {
        clock_.withhold();
        return std::nullopt;
    }
    return clock_.take(utc, local);
}

/// Told when it begins.
std::optional<Event> ChronyFeed::refuse(const std::string& problem) {
    clock_.withhold();
    return std::exchange(isRefusing_, true) ? std::nullopt
                                            : std::optional(failureEvent("chronyd", problem));
}

} // namespace vantelhost
