#include "Report/SeriesFigure.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include <fmt/format.h>

#include "Report/Units.h"

namespace vantelhost {

namespace {

/// Where values stand in a drawing.
class ValueAxis {
public:
    explicit ValueAxis(const Extent& range)
        : range_(range),
          base_(baseOf(range)),
          unit_(unitFor(std::max(std::abs(range.low - base_), std::abs(range.high - base_)))) {}

    /// At the edge if it is beyond.
    double at(double value) const { return place(std::clamp(value, range_.low, range_.high)); }

    /// With space for the marks at both edges.
    std::string commands(const std::string& name) const {
        const double space = std::max((range_.high - range_.low) / 20, unit_.size / 2);
        return fmt::format("set ylabel \"{} in {}\"\nset yrange [{:.12g}:{:.12g}]\n", name,
                           unit_.name, place(range_.low - space), place(range_.high + space));
    }

private:
    double place(double value) const { return (value - base_) / unit_.size; }

    Extent range_;
    double base_;
    Unit unit_;
};

/// The points of a line. One between two gaps becomes a dot: a line of no visible length.
std::string lineData(const std::vector<Point>& points, double gap, const TimeAxis& axis,
                     const ValueAxis& values, double dot) {
    std::string data;
    bool alone = true;
    for (std::size_t i = 0; i < points.size(); ++i) {
        const auto add = [&](double x) {
            data += fmt::format("{:.9g} {:.12g}\n", axis.at(x), values.at(points[i].y));
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

/// The corners of steps, one for each stretch; a stretch without a point leaves them apart.
std::string bandData(const std::vector<Stretch>& stretches, const TimeAxis& axis,
                     const ValueAxis& values) {
    std::string data;
    double end = stretches.front().begin;
    for (const auto& stretch : stretches) {
        std::string corner;
        for (const auto value : stretch.values) {
            corner += fmt::format(" {:.12g}", values.at(value));
        }
        data += fmt::format("{0}{1:.9g}{3}\n{2:.9g}{3}\n", stretch.begin > end ? "\n" : "",
                            axis.at(stretch.begin), axis.at(stretch.end), corner);
        end = stretch.end;
    }
    return data;
}

/// A short line for the lowest and one for the highest value of each stretch.
std::string extremesData(const std::vector<Stretch>& stretches, const TimeAxis& axis,
                         const ValueAxis& values) {
    std::string data;
    for (const auto& stretch : stretches) {
        for (const auto value : {stretch.values.front(), stretch.values.back()}) {
            data += fmt::format("{0:.9g} {2:.12g}\n{1:.9g} {2:.12g}\n\n", axis.at(stretch.begin),
                                axis.at(stretch.end), values.at(value));
        }
    }
    return data;
}

/// Where values are beyond the edge, no closer than can be told apart.
/// @param sign 1: above, -1: below
std::string edgeData(const std::vector<Point>& points, double edge, const TimeAxis& axis,
                     const ValueAxis& values, int sign, double distance) {
    std::string data;
    double next = 0;
    for (const auto& point : points) {
        if ((point.y - edge) * sign > 0 && point.x >= next) {
            data += fmt::format("{:.9g} {:.12g}\n", axis.at(point.x), values.at(edge));
            next = point.x + distance;
        }
    }
    return data;
}

/// The commands for a line, or for bands, and the plots that they are for.
struct Drawn {
    std::string data;
    std::string plots;
};

Drawn line(const Series& series, const SeriesStyle& style, const TimeAxis& axis,
           const ValueAxis& values) {
    const double dot = axis.pixel(canvases.front()) / 2;
    return {fmt::format("$data << END\n{}END\n",
                        lineData(series.points(), style.gap, axis, values, dot)),
            R"($data with lines lc rgb "#2b6cb0")"};
}

Drawn bands(const std::vector<Stretch>& stretches, const TimeAxis& axis, const ValueAxis& values) {
    return {
        fmt::format("$data << END\n{}END\n$extremes << END\n{}END\n",
                    bandData(stretches, axis, values), extremesData(stretches, axis, values)),
        R"($data using 1:3:7 with filledcurves lc rgb "#2b6cb0" fs transparent solid 0.3 noborder, )"
        R"($data using 1:4:6 with filledcurves lc rgb "#2b6cb0" fs transparent solid 0.5 noborder, )"
        R"($data using 1:5 with lines lc rgb "#2b6cb0", $extremes with lines lc rgb "#2b6cb0")"};
}

/// Where values may be beyond an edge: all points, or the extremes of stretches.
std::vector<Point> extremePoints(const Series& series, const std::vector<Stretch>& stretches) {
    if (series.isWhole()) {
        return series.points();
    }
    std::vector<Point> points;
    for (const auto& stretch : stretches) {
        const double middle = (stretch.begin + stretch.end) / 2;
        points.push_back({middle, stretch.values.front()});
        points.push_back({middle, stretch.values.back()});
    }
    return points;
}

/// Marks where values are beyond the edges.
Drawn edges(const std::vector<Point>& points, const Extent& range, const TimeAxis& axis,
            const ValueAxis& values, double distance) {
    const auto above = edgeData(points, range.high, axis, values, 1, distance);
    const auto below = edgeData(points, range.low, axis, values, -1, distance);
    return {
        fmt::format("$above << END\n{}END\n$below << END\n{}END\n", above, below),
        std::string(above.empty() ? "" : R"(, $above with points pt 9 ps 0.6 lc rgb "#d9480f")") +
            (below.empty() ? "" : R"(, $below with points pt 11 ps 0.6 lc rgb "#d9480f")")};
}

} // namespace

std::string seriesFigure(const Caption& caption, const Series& series, const SeriesStyle& style,
                         const TimeAxis& axis) {
    const ValueAxis values(style.range);
    const auto stretches =
        series.isWhole() ? std::vector<Stretch>() : series.distribution().stretches();
    const auto drawn =
        series.isWhole() ? line(series, style, axis, values) : bands(stretches, axis, values);
    const auto extremes = extremePoints(series, stretches);
    return draw(caption, 300, [&](const Canvas& canvas) {
        const auto marks = edges(extremes, style.range, axis, values, 6 * axis.pixel(canvas));
        return axis.commands(canvas) + values.commands(caption.name) + drawn.data + marks.data +
               "plot " + drawn.plots + marks.plots + "\n";
    });
}

} // namespace vantelhost
