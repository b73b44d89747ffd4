/// @file
/// Phases whose deviations are published: NIST Special Publication 1065, section 12.
#pragma once

#include <cstdint>
#include <vector>

/// Of frequencies at a distance of 1.
inline std::vector<double> phasesOf(const std::vector<double>& frequencies) {
    std::vector<double> phases{0};
    for (const double frequency : frequencies) {
        phases.push_back(phases.back() + frequency);
    }
    return phases;
}

/// The nine frequencies of NBS Monograph 140.
inline std::vector<double> nbsPhases() {
    return phasesOf({892, 809, 823, 798, 671, 644, 883, 903, 677});
}

/// The thousand frequencies of a generator of random numbers.
inline std::vector<double> thousandPhases() {
    std::vector<double> frequencies;
    for (std::uint64_t number = 1234567890; frequencies.size() < 1000;
         number = number * 16807 % 2147483647) {
        frequencies.push_back(static_cast<double>(number) / 2147483647);
    }
    return phasesOf(frequencies);
}
