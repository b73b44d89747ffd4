/// @file
/// What a measurement prints: one line per figure, its columns separated by tabs, that
/// scripts/bench.sh collects into one table.
#pragma once

#include <optional>
#include <string>

struct Row {
    std::string figure;
    std::string ports; ///< "" when the figure knows none
    double value;
    std::string unit;
    std::optional<double> ratio = std::nullopt; ///< of the plug-in to what the row shows
    std::optional<double> limit = std::nullopt; ///< of the ratio; without one, of the value
};

void print(const Row& row);
