#include "Report/Distribution.h"

#include <algorithm>
#include <utility>

#include "Report/Statistics.h"

namespace vantelhost {

namespace {

/// As many as can be told apart in a drawing.
constexpr std::size_t mostValues = 1024;

Stretch stretchOf(double begin, double end, const ValueCounts& values) {
    Stretch stretch{begin, end, {}};
    for (std::size_t mark = 0; mark < distributionMarks.size(); ++mark) {
        stretch.values[mark] = static_cast<double>(percentile(values, distributionMarks[mark]));
    }
    return stretch;
}

} // namespace

void Distribution::add(double x, std::int64_t y) {
    if (parts_.empty()) {
        begin_ = x;
    }
    const auto number = numberOf(x);
    if (number >= parts_.size()) {
        parts_.resize(number + 1, ValueCounts(mostValues));
    }
    parts_[number].add(y);
    last_ = x;
}

std::vector<Stretch> Distribution::stretches() const {
    std::vector<Stretch> result;
    double begin = begin_;
    for (const auto& part : parts_) {
        const double end = begin + width_;
        if (part.size() > 0) {
            result.push_back(stretchOf(begin, std::min(end, last_), part));
        }
        begin = end;
    }
    return result;
}

std::size_t Distribution::numberOf(double x) {
    while ((x - begin_) / width_ >= most) {
        halve();
    }
    return static_cast<std::size_t>((x - begin_) / width_);
}

void Distribution::halve() {
    for (std::size_t i = 0; i < parts_.size(); ++i) {
        if (i % 2 == 0) {
            std::swap(parts_[i / 2], parts_[i]);
        } else {
            parts_[i / 2].add(parts_[i]);
        }
    }
    parts_.resize((parts_.size() + 1) / 2, ValueCounts(mostValues));
    width_ *= 2;
}

} // namespace vantelhost
