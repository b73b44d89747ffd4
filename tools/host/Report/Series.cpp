#include "Report/Series.h"

namespace vantelhost {

void Series::add(double seconds, std::int64_t value) {
    values_.add(value);
    statistics_.add(value);
    distribution_.add(seconds, value);
    if (isWhole()) {
        points_.push_back({seconds, static_cast<double>(value)});
    }
}

} // namespace vantelhost
