#include "Report/Figure.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "Report/Drawing.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

double largestOf(const std::vector<Point>& points) {
    double largest = 0;
    for (const auto& point : points) {
        largest = std::max(largest, std::abs(point.y));
    }
    return largest;
}

/// The lines of data. A point between two gaps becomes a dot: a line of no visible length.
std::string seriesData(const std::vector<Point>& points, double gap, double dot, const Unit& xUnit,
                       const Unit& yUnit) {
    std::string data;
    bool alone = true;
    for (std::size_t i = 0; i < points.size(); ++i) {
        const auto add = [&](double x) {
            data += fmt::format("{:.9g} {:.9g}\n", x * 1e9 / xUnit.size, points[i].y / yUnit.size);
        };
        add(points[i].x);
        if (i + 1 < points.size() && points[i + 1].x - points[i].x <= gap) {
            alone = false;
            continue;
        }
        if (alone) {
            add(points[i].x > dot ? points[i].x - dot : points[i].x + dot);
        }
        data += '\n';
        alone = true;
    }
    return data;
}

} // namespace

std::string seriesFigure(const Caption& caption, const std::vector<Point>& points, double duration,
                         double gap) {
    const auto xUnit = unitForDuration(duration);
    const auto yUnit = unitFor(largestOf(points));
    const double dot = duration / (2 * drawingWidth);
    return draw(caption, 260,
                timeAxis(duration, xUnit) +
                    fmt::format("set ylabel \"{} in {}\"\n$data << END\n{}END\n"
                                "plot $data with lines lc rgb \"#2b6cb0\"\n",
                                caption.name, yUnit.name,
                                seriesData(points, gap, dot, xUnit, yUnit)));
}

std::string histogramFigure(const Caption& caption, const Histogram& histogram) {
    const auto count = static_cast<double>(histogram.counts.size());
    const double end = histogram.low + histogram.width * count;
    const auto unit = unitFor(std::max(std::abs(histogram.low), std::abs(end)));
    std::string data;
    for (std::size_t bin = 0; bin < histogram.counts.size(); ++bin) {
        const double middle = histogram.low + histogram.width * (static_cast<double>(bin) + 0.5);
        data += fmt::format("{:.12g} {}\n", middle / unit.size, histogram.counts[bin]);
    }
    return draw(caption, 260,
                fmt::format("set xlabel \"offset in {}\"\nset ylabel \"pairs\"\n"
                            "set xrange [{:.12g}:{:.12g}]\nset yrange [0:*]\n"
                            "set boxwidth {:.12g}\nset style fill solid noborder\n"
                            "$data << END\n{}END\nplot $data with boxes lc rgb \"#2b6cb0\"\n",
                            unit.name, histogram.low / unit.size, end / unit.size,
                            histogram.width / unit.size, data));
}

std::string deviationFigure(const Caption& caption, const std::vector<Deviation>& deviations) {
    std::string data;
    for (const auto& each : deviations) {
        if (each.value > 0) {
            data += fmt::format("{:.9g} {:.9g}\n", each.tau, each.value);
        }
    }
    // A range of its own: a single point has none.
    return draw(caption, 320,
                fmt::format("set xlabel \"averaging time tau in s\"\nset ylabel \"deviation\"\n"
                            "set logscale xy\nset format y \"%.0e\"\nset format x \"%g\"\n"
                            "set xrange [{:.9g}:{:.9g}]\n$data << END\n{}END\n"
                            "plot $data with linespoints lc rgb \"#2b6cb0\" pt 7 ps 0.5\n",
                            deviations.front().tau / 1.5, deviations.back().tau * 1.5, data));
}

} // namespace vantelhost
