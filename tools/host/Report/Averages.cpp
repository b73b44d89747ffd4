#include "Report/Averages.h"

namespace vantelhost {

void Averages::add(const PhaseSample& sample) {
    if (sample.begins) {
        first_ = sample.slot;
        sum_ = 0;
        samples_ = 0;
    } else if (sample.slot - first_ >= length_) {
        close();
        first_ = sample.slot - (sample.slot - first_) % length_;
    }
    sum_ += sample.phase;
    ++samples_;
    if (sample.slot - first_ == length_ - 1) {
        close();
    }
}

/// None of a stretch that has been closed already: it has no samples any more.
void Averages::close() {
    if (samples_ * 2 >= length_) {
        const double mean = sum_ / static_cast<double>(samples_);
        extent_ = joined(extent_, mean);
        ++count_;
    }
    sum_ = 0;
    samples_ = 0;
}

} // namespace vantelhost
