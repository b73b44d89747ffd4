/// @file
#pragma once

#include <vector>

double median(std::vector<double> values);

/// @param share from 0, the smallest value, to 1, the largest.
double quantile(std::vector<double> values, double share);

/// The median of the ratios, pair by pair.
double medianRatio(const std::vector<double>& values, const std::vector<double>& others);

/// How far the worst of the points is from the straight line that fits them best, as a share of
/// what the line says there. The best fit is that of the smallest relative squares.
double deviationFromLine(const std::vector<double>& x, const std::vector<double>& y);
