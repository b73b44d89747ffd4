#include "OffsetWindow.h"

#include <algorithm>

namespace vantelhost {

void OffsetWindow::add(double seconds, std::int64_t offset) {
    offsets_.erase(offsets_.cbegin(), oldest(seconds));
    offsets_.emplace_back(seconds, offset);
}

OffsetStatistics OffsetWindow::statistics(double now) const {
    OffsetStatistics statistics;
    std::for_each(oldest(now), offsets_.cend(),
                  [&](const auto& each) { statistics.add(each.second); });
    return statistics;
}

double OffsetWindow::rate(double now) const {
    const auto first = oldest(now);
    const auto count = offsets_.cend() - first;
    if (count < 2 || now <= first->first) {
        return 0;
    }
    return static_cast<double>(count - 1) / (now - first->first);
}

std::deque<std::pair<double, std::int64_t>>::const_iterator OffsetWindow::oldest(double now) const {
    return std::find_if(offsets_.cbegin(), offsets_.cend(),
                        [&](const auto& each) { return each.first >= now - length_; });
}

} // namespace vantelhost
