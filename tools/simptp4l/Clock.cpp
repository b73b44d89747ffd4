#include "Clock.h"

#include "Random.h"

#include <algorithm>
#include <cmath>
#include <ctime>

namespace simptp4l {
namespace {

std::int64_t intervalOf(const Script& script, int logSyncInterval) {
    if (script.syncInterval) {
        return *script.syncInterval;
    }
    const int bounded = std::clamp(logSyncInterval, -20, 20);
    return static_cast<std::int64_t>(std::ldexp(1e9, bounded));
}

std::int64_t readClock(clockid_t clock) {
    timespec time{};
    static_assert(sizeof(time.tv_sec) == 8, "goes on after 2038");
    clock_gettime(clock, &time);
    return std::int64_t{time.tv_sec} * 1000000000 + time.tv_nsec;
}

} // namespace

Clock::Clock(const Script& script, int logSyncInterval, std::int64_t start)
    : script_(script),
      start_(start),
      interval_(intervalOf(script, logSyncInterval)),
      present_(script.gmPresent),
      since_(script.gmAfter) {
    if (script.clock == ClockSource::steered) {
        start_ = (*steered_.emplace(script.steeredFile)).now;
    }
}

ClockReading Clock::read(std::int64_t now) {
    now = elapsed(now);
    const bool present = present_ && now >= since_;
    if (present) {
        const std::int64_t index = (now - since_) / interval_;
        const std::int64_t arrival = since_ + index * interval_;
        if (arrival != last_) {
            measure(arrival, static_cast<std::uint64_t>(index));
        }
        seen_ = true;
    }
    return {present, seen_, offset_, ingress_};
}

void Clock::setGrandmaster(bool present, std::int64_t now) {
    now = elapsed(now);
    if (present == present_ && (!present || now >= since_)) {
        return;
    }
    // A last reading, so that a grandmaster nobody asked about still counts as seen.
    read(now);
    present_ = present;
    since_ = now;
    last_ = -1;
    ingress_ = 0;
}

void Clock::step(std::int64_t difference) {
    stepped_ += difference;
    offset_ += difference;
    if (ingress_ != 0) {
        ingress_ += difference;
    }
}

std::int64_t Clock::elapsed(std::int64_t now) const {
    return steered_ ? (*steered_)->now - start_ : now;
}

void Clock::measure(std::int64_t arrival, std::uint64_t index) {
    last_ = arrival;
    ingress_ = ingressOf(arrival) + script_.clockOffset + stepped_;
    // Without a delay no offset can be told: the last one stays.
    if (index >= script_.syncsBeforeDelay) {
        const double drift = script_.driftPpb * (static_cast<double>(arrival) / 1e9);
        offset_ = script_.offset + std::llround(drift) + jitter(index) + stepped_ +
                  steeredOffset(arrival);
    }
}

std::int64_t Clock::ingressOf(std::int64_t arrival) const {
    switch (script_.clock) {
    case ClockSource::fixed:
        return script_.fixedTime;
    case ClockSource::monotonic:
        return start_ + arrival;
    case ClockSource::steered:
        return (*steered_)->localAt(start_ + arrival);
    case ClockSource::realtime:
        break;
    }
    return start_ + arrival + readClock(CLOCK_REALTIME) - readClock(CLOCK_MONOTONIC);
}

std::int64_t Clock::steeredOffset(std::int64_t arrival) const {
    return steered_ ? ingressOf(arrival) - (start_ + arrival) - (*steered_)->grandmaster : 0;
}

std::int64_t Clock::jitter(std::uint64_t index) const {
    if (script_.jitter == 0) {
        return 0;
    }
    const std::uint64_t span = 2 * static_cast<std::uint64_t>(script_.jitter) + 1;
    return static_cast<std::int64_t>(Random(script_.seed + index).next() % span) - script_.jitter;
}

} // namespace simptp4l
