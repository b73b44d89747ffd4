#include "PairFilter.h"

#include <fmt/format.h>

#include "QualityReasons.h"

namespace vantelhost {

std::string noDelayText(std::int64_t offset, std::uint64_t count) {
    return fmt::format("offset exactly {0} in {1} of {1} pairs: no delay is measured: "
                       "delayMechanism?",
                       offset == 0 ? "0" : fmt::format("{} ns", offset), count);
}

void PairFilter::epochOffset(std::int64_t nanoseconds) {
    epochOffset_ = static_cast<std::uint64_t>(nanoseconds);
}

bool PairFilter::quality(std::string_view quality, std::string_view reason) {
    // The only reason that tells of a grandmaster; others come and go while it stays.
    if (reason != roleHasChanged) {
        return false;
    }
    hasGrandmaster_ = quality == "usable";
    isMeasuring_ = false;
    return hasGrandmaster_;
}

PairKind PairFilter::pair(std::uint64_t local, std::int64_t offset) {
    const auto masterOffset = static_cast<std::uint64_t>(offset) - epochOffset_;
    const bool of1970 = isOf1970(local);
    isMeasuring_ = isMeasuring_ || masterOffset != masterOffset_;
    lastLocal_ = local;
    masterOffset_ = masterOffset;
    if (of1970) {
        ++counts_.of1970;
        return PairKind::of1970;
    }
    if (!isMeasuring_) {
        ++counts_.falseOffsets;
        return PairKind::falseOffset;
    }
    ++counts_.measured;
    return PairKind::measured;
}

bool PairFilter::isOf1970(std::uint64_t local) const {
    const bool goesBack = static_cast<std::int64_t>(local - lastLocal_) < 0;
    return local == epochOffset_ || (!hasGrandmaster_ && goesBack);
}

} // namespace vantelhost
