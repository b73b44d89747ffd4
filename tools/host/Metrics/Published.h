/// @file
#pragma once

#include <memory>
#include <mutex>
#include <utility>

namespace vantelhost {

/// A value that one thread replaces now and then, and any thread reads. Neither waits for longer
/// than it takes to copy a pointer.
template <typename Value>
class Published {
public:
    void set(Value value) {
        auto next = std::make_shared<const Value>(std::move(value));
        const std::lock_guard lock(mutex_);
        value_.swap(next);
    }

    /// The value lives as long as what is returned.
    std::shared_ptr<const Value> get() const {
        const std::lock_guard lock(mutex_);
        return value_;
    }

private:
    mutable std::mutex mutex_;
    std::shared_ptr<const Value> value_ = std::make_shared<const Value>();
};

} // namespace vantelhost
