#include "Report/ValueCounts.h"

#include <algorithm>

namespace vantelhost {

namespace {

/// Adds to the last row if that has the same value.
void append(std::vector<ValueCounts::Row>& rows, const ValueCounts::Row& row) {
    if (!rows.empty() && rows.back().value == row.value) {
        rows.back().count += row.count;
    } else {
        rows.push_back(row);
    }
}

} // namespace

void ValueCounts::add(std::int64_t value) {
    extend(value, value, 1);
    pending_.push_back(value);
    if (pending_.size() >= most_ / 4) {
        settle();
    }
}

void ValueCounts::add(const ValueCounts& others) {
    if (others.size_ == 0) {
        return;
    }
    settle();
    others.settle();
    extend(others.smallest_, others.largest_, others.size_);
    width_ = std::max(width_, others.width_);
    merge(others.rows_);
}

std::vector<ValueCounts::Row> ValueCounts::rows() const {
    settle();
    auto rows = rows_;
    for (auto& row : rows) {
        row.value = middleOf(row.value);
    }
    return rows;
}

std::int64_t ValueCounts::at(std::uint64_t rank) const {
    settle();
    if (rank == 0 || rank + 1 >= size_) {
        return rank == 0 ? smallest_ : largest_;
    }
    auto row = rows_.begin();
    for (; rank >= row->count; ++row) {
        rank -= row->count;
    }
    return middleOf(row->value);
}

std::int64_t ValueCounts::stepOf(std::int64_t value) const {
    return value & -width_; // rounds down, negative ones too
}

std::int64_t ValueCounts::middleOf(std::int64_t step) const {
    return std::clamp(step + width_ / 2, smallest_, largest_);
}

void ValueCounts::extend(std::int64_t low, std::int64_t high, std::uint64_t count) {
    smallest_ = size_ == 0 ? low : std::min(smallest_, low);
    largest_ = size_ == 0 ? high : std::max(largest_, high);
    size_ += count;
}

void ValueCounts::settle() const {
    if (pending_.empty()) {
        return;
    }
    std::sort(pending_.begin(), pending_.end());
    std::vector<Row> rows;
    for (const auto value : pending_) {
        append(rows, {value, 1});
    }
    pending_.clear();
    merge(rows);
}

/// @param others ascending
void ValueCounts::merge(const std::vector<Row>& others) const {
    std::vector<Row> all;
    all.reserve(rows_.size() + others.size());
    auto mine = rows_.begin();
    for (const auto& other : others) {
        for (; mine != rows_.end() && mine->value <= other.value; ++mine) {
            append(all, {stepOf(mine->value), mine->count});
        }
        append(all, {stepOf(other.value), other.count});
    }
    for (; mine != rows_.end(); ++mine) {
        append(all, {stepOf(mine->value), mine->count});
    }
    rows_ = std::move(all);
    while (rows_.size() > most_) {
        widen();
    }
    rows_.shrink_to_fit();
}

void ValueCounts::widen() const {
    width_ *= 2;
    std::vector<Row> wider;
    for (const auto& row : rows_) {
        append(wider, {stepOf(row.value), row.count});
    }
    rows_ = std::move(wider);
}

} // namespace vantelhost
