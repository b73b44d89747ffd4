/// @file
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "Report/ValueCounts.h"

namespace vantelhost {

/// What a stretch tells of its values, in thousandths: the lowest, parts of all, the highest.
constexpr std::array<unsigned, 7> distributionMarks{0, 10, 250, 500, 750, 990, 1000};

/// How the points of a stretch along x are distributed along y.
struct Stretch {
    double begin;
    double end;
    std::array<double, distributionMarks.size()> values; ///< one for each mark; they ascend
};

/// Cuts points along x into stretches of equal length, in bounded memory: where there would be more
/// than the most, each two become one. Between the lowest and the highest y, values are exact to a
/// thousandth of what is between them, about.
class Distribution {
public:
    static constexpr std::size_t most = 512;

    /// @param x never descends
    void add(double x, std::int64_t y);

    /// Those with a point. Once the first width has not sufficed, more than half of the most if all
    /// have one.
    std::vector<Stretch> stretches() const;

    /// Of a stretch.
    double width() const { return width_; }

private:
    std::size_t numberOf(double x);
    void halve();

    double begin_ = 0;
    double last_ = 0;
    double width_ = 1.0 / 1024; // doubled without rounding
    std::vector<ValueCounts> parts_;
};

} // namespace vantelhost
