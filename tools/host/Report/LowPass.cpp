#include "Report/LowPass.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

constexpr double pi = 3.14159265358979323846;

} // namespace

LowPass::LowPass(double cutoff, double interval)
    : weight_(1 - std::exp(-2 * pi * cutoff * interval)),
      settling_(5 / (2 * pi * cutoff * interval)) {}

std::optional<double> LowPass::next(const PhaseSample& sample) {
    if (sample.begins) {
        count_ = 0;
    }
    ++count_;
    // At first the mean: what the very first sample has been would be seen for long.
    level_ += (sample.phase - level_) * std::max(weight_, 1 / count_);
    return count_ > settling_ ? std::optional(level_) : std::nullopt;
}

} // namespace vantelhost
