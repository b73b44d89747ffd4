#include "Report/PairSeries.h"

namespace vantelhost {

void PairSeries::add(const Pair& pair) {
    if (!isInterrupted_) {
        intervals_.add(pair.seconds, static_cast<std::int64_t>(pair.ingress - last_->ingress));
    }
    offsets_.add(pair.seconds, pair.offset);
    delays_.add(pair.seconds, pair.delay);
    grid_.add(pair.ingress, pair.offset);
    firstSeconds_ = last_ ? firstSeconds_ : pair.seconds;
    last_ = pair;
    isInterrupted_ = false;
}

void PairSeries::interrupt() {
    isInterrupted_ = true;
    grid_.interrupt();
}

double PairSeries::rate() const {
    const double time = last_ ? last_->seconds - firstSeconds_ : 0;
    return time > 0 ? static_cast<double>(offsets_.statistics().count - 1) / time : 0;
}

} // namespace vantelhost
