/// @file
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace vantelhost {

/// How often each of many integers came, in bounded memory. Exact until too many different ones
/// have come: then they are counted in steps of a power of two, and stand in the step's middle. The
/// smallest and the largest stay exact. Not thread-safe, reading neither.
class ValueCounts {
public:
    struct Row {
        std::int64_t value;
        std::uint64_t count;
    };

    /// @param most so many different values are kept; at least 4
    explicit ValueCounts(std::size_t most = std::size_t{1} << 20U) : most_(most) {}

    void add(std::int64_t value);
    void add(const ValueCounts& others);

    std::uint64_t size() const { return size_; }

    /// Of no values both are 0.
    std::int64_t smallest() const { return smallest_; }
    std::int64_t largest() const { return largest_; }

    /// Ascending.
    std::vector<Row> rows() const;

    /// @param rank below the size; 0: the smallest one
    std::int64_t at(std::uint64_t rank) const;

private:
    std::int64_t stepOf(std::int64_t value) const;
    std::int64_t middleOf(std::int64_t step) const;
    void extend(std::int64_t low, std::int64_t high, std::uint64_t count);
    void settle() const;
    void merge(const std::vector<Row>& others) const;
    void widen() const;

    std::size_t most_;
    std::uint64_t size_ = 0;
    std::int64_t smallest_ = 0;
    std::int64_t largest_ = 0;
    // Values are put in order many at a time, and before they are read.
    mutable std::int64_t width_ = 1;
    mutable std::vector<Row> rows_; ///< the beginnings of steps, ascending
    mutable std::vector<std::int64_t> pending_;
};

} // namespace vantelhost
