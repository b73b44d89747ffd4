#include "Report/Figure.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "Report/Units.h"

namespace vantelhost {

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

std::string deviationFigure(const Caption& caption, const std::vector<Deviation>& deviations) {
    std::string data;
    for (const auto& each : deviations) {
        if (each.value > 0) {
            data += fmt::format("{:.9g} {:.9g}\n", each.tau, each.value);
        }
    }
    return draw(caption, 320, [&](const Canvas&) {
        // A range of its own: a single point has none.
        return fmt::format("set xlabel \"averaging time tau in s\"\nset ylabel \"deviation\"\n"
                           "set logscale xy\nset format y \"%.0e\"\nset format x \"%g\"\n"
                           "set xrange [{:.9g}:{:.9g}]\n$data << END\n{}END\n"
                           "plot $data with linespoints lc rgb \"#2b6cb0\" pt 7 ps 0.5\n",
                           deviations.front().tau / 1.5, deviations.back().tau * 1.5, data);
    });
}

} // namespace vantelhost
