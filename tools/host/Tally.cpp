#include "Tally.h"

#include <algorithm>
#include <cmath>

#include "PairFilter.h"

namespace vantelhost {

void OffsetStatistics::add(std::int64_t offset) {
    smallest = count == 0 ? offset : std::min(smallest, offset);
    largest = count == 0 ? offset : std::max(largest, offset);
    ++count;
    const auto value = static_cast<long double>(offset);
    sum += value;
    squares += value * value;
}

double OffsetStatistics::mean() const {
    return count == 0 ? 0 : static_cast<double>(sum / static_cast<long double>(count));
}

double OffsetStatistics::rms() const {
    return count == 0 ? 0
                      : static_cast<double>(std::sqrt(squares / static_cast<long double>(count)));
}

std::string frozenOffsets(const OffsetStatistics& offsets) {
    // A sound ptp4l begins with up to 15 of them.
    constexpr std::uint64_t fewest = 20;
    if (offsets.count < fewest || offsets.smallest != offsets.largest) {
        return {};
    }
    return noDelayText(offsets.smallest, offsets.count);
}

} // namespace vantelhost
