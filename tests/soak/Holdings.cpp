#include "Holdings.h"

#include <algorithm>
#include <fstream>
#include <limits>
#include <numeric>
#include <string>

#include "support/Descriptors.h"
#include "support/Processes.h"

Holdings Holdings::now() {
    Holdings holdings;
    std::ifstream status("/proc/self/status");
    for (std::string word; status >> word && word != "VmRSS:";) {
        status.ignore(std::numeric_limits<std::streamsize>::max(), '\n');
    }
    status >> holdings.resident;
    status.close();
    holdings.descriptors = openDescriptors();
    holdings.threads = threadCount();
    return holdings;
}

void Trend::add(double seconds, double value) {
    if (count_ < window_) {
        first_ += value;
    }
    last_[count_ % window_] = value;
    ++count_;
    peak_ = std::max(peak_, value);
    seconds_ += seconds;
    values_ += value;
    secondsSquared_ += seconds * seconds;
    products_ += seconds * value;
}

double Trend::start() const {
    return count_ == 0 ? 0 : first_ / std::min(count_, window_);
}

double Trend::end() const {
    const unsigned samples = std::min(count_, window_);
    return samples == 0 ? 0 : std::accumulate(last_, last_ + samples, 0.0) / samples;
}

double Trend::perHour() const {
    const double variance = count_ * secondsSquared_ - seconds_ * seconds_;
    return variance <= 0 ? 0 : (count_ * products_ - seconds_ * values_) / variance * 3600;
}
