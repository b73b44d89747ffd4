/// @file
/// Reproducible pseudo-random numbers.
#pragma once

#include <cstdint>

namespace simptp4l {

/// The splitmix64 generator: the same seed gives the same numbers on every machine.
class Random {
public:
    explicit Random(std::uint64_t seed) : state_(seed) {}

    std::uint64_t next() {
        state_ += 0x9E3779B97F4A7C15;
        std::uint64_t mixed = state_;
        mixed = (mixed ^ (mixed >> 30)) * 0xBF58476D1CE4E5B9;
        mixed = (mixed ^ (mixed >> 27)) * 0x94D049BB133111EB;
        return mixed ^ (mixed >> 31);
    }

private:
    std::uint64_t state_;
};

} // namespace simptp4l
