#include "PairTrust.h"

#include <cmath>
#include <utility>

namespace vantelhost {

void PairTrust::epochOffset(std::int64_t nanoseconds) {
    epochOffset_ = static_cast<std::uint64_t>(nanoseconds);
    filter_.epochOffset(nanoseconds);
}

void PairTrust::quality(std::string_view quality, std::string_view reason) {
    constexpr unsigned falseAfterReturn = 2;
    if (filter_.quality(quality, reason) && filter_.counts().measured > 0) {
        returning_ = falseAfterReturn;
    }
}

PairKind PairTrust::pair(std::uint64_t local, std::int64_t offset, const Moment& moment) {
    if (hasStepped(moment)) {
        level_.distrust();
    }
    const PairKind kind = filter_.pair(local, offset);
    // As ptp4l gave them: an epoch offset is no step of a clock.
    return kind == PairKind::measured
               ? judge(local - epochOffset_,
                       static_cast<std::int64_t>(static_cast<std::uint64_t>(offset) - epochOffset_))
               : kind;
}

PairKind PairTrust::judge(std::uint64_t local, std::int64_t offset) {
    if (isRepeated(offset)) {
        return PairKind::repeated;
    }
    if (returning_ > 0) {
        --returning_;
        return PairKind::afterReturn;
    }
    const double seconds = static_cast<double>(local) * 1e-9;
    return level_.take(seconds, offset) ? PairKind::measured : PairKind::jump;
}

bool PairTrust::isRepeated(std::int64_t offset) {
    constexpr std::uint64_t mostEqual = 7;
    equals_ = offset == lastOffset_ ? equals_ + 1 : 1;
    lastOffset_ = offset;
    return equals_ > mostEqual;
}

bool PairTrust::hasStepped(const Moment& moment) {
    constexpr double smallest = 1e-3;
    const auto last = std::exchange(lastMoment_, moment);
    if (!last) {
        return false;
    }
    const auto passed = static_cast<std::int64_t>(moment.realtime - last->realtime);
    const double step = static_cast<double>(passed) * 1e-9 - (moment.seconds - last->seconds);
    return std::abs(step) > smallest;
}

} // namespace vantelhost
