/// @file
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <random>

/// Where everything random comes from. The same seed gives the same numbers on every machine, which
/// the distributions of the standard library do not promise.
class Dice {
public:
    explicit Dice(std::uint64_t seed) : engine_(seed) {}

    /// @return 0 to n - 1.
    unsigned below(unsigned n) { return static_cast<unsigned>(engine_() % n); }

    /// @return low to high, in hundredths.
    double between(double low, double high) {
        return low + below(static_cast<unsigned>((high - low) * 100) + 1) / 100.0;
    }

    template <typename T, std::size_t size>
    const T& pick(const std::array<T, size>& choice) {
        return choice[below(size)];
    }

private:
    std::mt19937_64 engine_;
};

/// Deals every card of a deck once, in random order, before any comes again.
template <std::size_t size>
class Deck {
public:
    std::size_t deal(Dice& dice) {
        if (left_ == 0) {
            for (; left_ < size; ++left_) {
                cards_[left_] = left_;
            }
        }
        const std::size_t chosen = dice.below(static_cast<unsigned>(left_));
        const std::size_t card = cards_[chosen];
        cards_[chosen] = cards_[--left_];
        return card;
    }

private:
    std::array<std::size_t, size> cards_{};
    std::size_t left_ = 0;
};
