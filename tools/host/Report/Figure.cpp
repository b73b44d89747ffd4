#include "Report/Figure.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <string_view>

#include <fmt/format.h>

#include "Report/Colours.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

std::string curveData(const std::vector<TauValue>& values) {
    std::string data;
    for (const auto& each : values) {
        if (each.value > 0) {
            data += fmt::format("{:.9g} {:.9g}\n", each.tau, each.value);
        }
    }
    return data;
}

struct Extents {
    Extent taus;
    Extent values;
};

/// Of what is drawn.
Extents extentsOf(const std::vector<Curve>& curves, const std::optional<Mask>& mask) {
    std::optional<Extent> taus;
    std::optional<Extent> values;
    const auto add = [&](double tau, double value) {
        if (value > 0) {
            taus = joined(taus, tau);
            values = joined(values, value);
        }
    };
    for (const auto& curve : curves) {
        for (const auto& each : curve.values) {
            add(each.tau, each.value);
        }
    }
    if (mask) {
        add(mask->from, mask->limit);
        add(mask->to, mask->limit);
    }
    return {taus.value_or(Extent{1, 1}), values.value_or(Extent{1, 1})};
}

/// An axis of whole decades has labels that tell them.
double decadeBelow(double value) {
    return std::pow(10, std::floor(std::log10(value)));
}

/// Not the value itself: it is to be seen.
double decadeAbove(double value) {
    return std::pow(10, std::floor(std::log10(value)) + 1);
}

} // namespace

std::string histogramFigure(const Caption& caption, const Histogram& histogram) {
    const auto count = static_cast<double>(histogram.counts.size());
    const double end = histogram.low + histogram.width * count;
    const double base = baseOf({histogram.low, end});
    const auto unit = unitFor(std::max(std::abs(histogram.low - base), std::abs(end - base)));
    const auto place = [&](double value) { return (value - base) / unit.size; };
    std::string data;
    for (std::size_t bin = 0; bin < histogram.counts.size(); ++bin) {
        const double middle = histogram.low + histogram.width * (static_cast<double>(bin) + 0.5);
        data += fmt::format("{:.12g} {}\n", place(middle), histogram.counts[bin]);
    }
    return draw(caption, 260, [&](const Canvas& canvas) {
        return fmt::format("set xlabel \"offset in {}\"\nset ylabel \"pairs\"\n"
                           "set xrange [{:.12g}:{:.12g}]\nset xtics {:.12g}\nset yrange [0:*]\n"
                           "set boxwidth {:.12g}\nset style fill solid noborder\n"
                           "$data << END\n{}END\nplot $data with boxes lc rgb \"#2b6cb0\"\n",
                           unit.name, place(histogram.low), place(end),
                           roundWidth((end - histogram.low) / canvas.texts) / unit.size,
                           histogram.width / unit.size, data);
    });
}

std::string tauFigure(const Caption& caption, const std::string& name,
                      const std::vector<Curve>& curves, const std::optional<Mask>& mask) {
    const auto [taus, values] = extentsOf(curves, mask);
    std::string data;
    std::string plots;
    for (std::size_t i = 0; i < curves.size(); ++i) {
        data += fmt::format("$curve{} << END\n{}END\n", i, curveData(curves[i].values));
        plots += fmt::format("$curve{} with linespoints lc rgb \"#{:06x}\" pt 7 ps 0.5, ", i,
                             curves[i].colour);
    }
    if (mask) {
        data += fmt::format("$mask << END\n{0:.9g} {2:.9g}\n{1:.9g} {2:.9g}\nEND\n", mask->from,
                            mask->to, mask->limit);
        plots += fmt::format("$mask with lines lc rgb \"#{:06x}\" dt 2 lw 2, ", maskColour);
    }
    plots.resize(plots.size() - std::string_view(", ").size());
    return draw(caption, 320, [&, &taus = taus, &values = values](const Canvas&) {
        return fmt::format("set xlabel \"averaging time tau in s\"\nset ylabel \"{}\"\n"
                           "set logscale xy\nset format y \"%g\"\nset format x \"%g\"\n"
                           "set xrange [{:.9g}:{:.9g}]\nset yrange [{:.9g}:{:.9g}]\n{}plot {}\n",
                           name, taus.low / 1.5, taus.high * 1.5, decadeBelow(values.low),
                           decadeAbove(values.high), data, plots);
    });
}

} // namespace vantelhost
