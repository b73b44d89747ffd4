/// @file
#pragma once

#include <utility>

#include <unistd.h>

/// Owns a file descriptor.
class Descriptor {
public:
    /// @param number -1 for none.
    explicit Descriptor(int number = -1) : number_(number) {}
    ~Descriptor() { close(); }
    Descriptor(Descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
    Descriptor& operator=(Descriptor&& other) noexcept {
        std::swap(number_, other.number_);
        return *this;
    }

    int get() const { return number_; }
    bool isOpen() const { return number_ >= 0; }

    void close() {
        if (isOpen()) {
            ::close(number_);
            number_ = -1;
        }
    }

private:
    int number_;
};
