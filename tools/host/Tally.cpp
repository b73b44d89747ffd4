#include "Tally.h"

#include <algorithm>
#include <cmath>

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

} // namespace vantelhost
