#include "Statistics.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

double median(std::vector<double> values) {
    return quantile(std::move(values), 0.5);
}

double quantile(std::vector<double> values, double share) {
    std::sort(values.begin(), values.end());
    return values.at(
        static_cast<std::size_t>(std::lround(share * static_cast<double>(values.size() - 1))));
}

double medianRatio(const std::vector<double>& values, const std::vector<double>& others) {
    std::vector<double> ratios;
    for (std::size_t i = 0; i < values.size(); ++i) {
        ratios.push_back(values[i] / others.at(i));
    }
    return median(ratios);
}

double deviationFromLine(const std::vector<double>& x, const std::vector<double>& y) {
    double sum = 0;
    double sumX = 0;
    double sumXX = 0;
    double sumY = 0;
    double sumXY = 0;
    for (std::size_t i = 0; i < x.size(); ++i) {
        const double weight = 1 / (y[i] * y[i]);
        sum += weight;
        sumX += weight * x[i];
        sumXX += weight * x[i] * x[i];
        sumY += weight * y[i];
        sumXY += weight * x[i] * y[i];
    }
    const double slope = (sum * sumXY - sumX * sumY) / (sum * sumXX - sumX * sumX);
    const double start = (sumY - slope * sumX) / sum;
    double worst = 0;
    for (std::size_t i = 0; i < x.size(); ++i) {
        const double line = start + slope * x[i];
        worst = std::max(worst, std::abs(y[i] - line) / line);
    }
    return worst;
}
