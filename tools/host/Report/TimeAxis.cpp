#include "Report/TimeAxis.h"

#include <algorithm>

#include <fmt/format.h>

#include "Report/WallClock.h"

namespace vantelhost {

TimeAxis::TimeAxis(const Recording& recording)
    : origin_(recording.runs > 1 ? "record's begin" : "host's start"),
      begin_(recording.begin),
      duration_(std::max(recording.duration, 1e-6)),
      unit_(unitForDuration(recording.duration)),
      outages_(outages(recording)) {}

std::string TimeAxis::commands(const Canvas& canvas) const {
    const auto step = roundStep(duration_, canvas.texts);
    const double end = at(duration_);
    return fmt::format("set xlabel \"time since the {} in {}\"\n"
                       "set xrange [0:{:.9g}]\nset x2range [0:{:.9g}]\n",
                       origin_, unit_.name, end, end) +
           // Below its smallest step gnuplot finds a better one.
           (step > 1 ? fmt::format("set xtics {:.9g}\n", at(static_cast<double>(step))) : "") +
           wallClock(step) + shades(canvas);
}

std::string TimeAxis::wallClock(std::int64_t step) const {
    std::string ticks;
    for (const auto& tick : wallTicks(begin_, duration_, step)) {
        ticks +=
            fmt::format("{}\"{}\" {:.9g}", ticks.empty() ? "" : ", ", tick.label, at(tick.seconds));
    }
    const auto date = shownDate(static_cast<std::int64_t>(begin_ / 1000000000U));
    return fmt::format("set x2label \"UTC, from {}\"\nset x2tics ({}) nomirror\n", date, ticks);
}

/// Neighbours that cannot be told apart become one, or there could be thousands.
std::string TimeAxis::shades(const Canvas& canvas) const {
    std::string commands;
    for (auto outage = outages_.begin(); outage != outages_.end();) {
        const double begin = outage->begin;
        double end = begin + pixel(canvas);
        for (; outage != outages_.end() && outage->begin <= end; ++outage) {
            end = std::max(end, outage->end);
        }
        commands += fmt::format("set object rectangle from {:.9g}, graph 0 to {:.9g}, graph 1 "
                                "behind fc rgb \"#e08e0b\" fs transparent solid 0.2 noborder\n",
                                at(begin), at(std::min(end, duration_)));
    }
    return commands;
}

} // namespace vantelhost
