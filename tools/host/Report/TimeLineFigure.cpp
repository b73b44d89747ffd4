#include "Report/TimeLineFigure.h"

#include <algorithm>
#include <array>
#include <string_view>

#include <fmt/format.h>

#include "Report/Html.h"

namespace vantelhost {

namespace {

/// Without what gnuplot could take for the end of a text; cut to what a narrow drawing takes.
std::string rowName(const std::string& name) {
    constexpr std::size_t longest = 30;
    std::string plain = name.substr(0, longest);
    for (auto& character : plain) {
        const bool allowed = (character >= '0' && character <= '9') ||
                             (character >= 'A' && character <= 'Z') ||
                             (character >= 'a' && character <= 'z') || character == ' ' ||
                             character == '.' || character == '-' || character == '_';
        character = allowed ? character : '?';
    }
    return plain;
}

struct Colour {
    std::string_view label;
    unsigned value;
};

constexpr std::array<Colour, 22> colours{{
    {"usable: PTP role has changed.", 0x2A9D4A},
    {"unusable: PTP role has changed.", 0x8E5EA2},
    {"unusable: Waiting for ptp4l status", 0x9AA0A6},
    {"unusable: PTP sub process has died unexpectedly", 0xC0392B},
    {"unusable: Unable to communicate with PTP sub process while attempting to retrieve time data",
     0xE08E0B},
    // It follows, and stays so where ptp4l steers no clock: as good as a slave.
    {"PTP_UNCALIBRATED", 0x2A9D4A},
    {"PTP_SLAVE", 0x2A9D4A},
    {"PTP_MASTER", 0x3B7DD8},
    {"PTP_LISTENING", 0x9AA0A6},
    {"PTP_FAULTY", 0xC0392B},
    {"PTP_PASSIVE", 0x8E5EA2},
    {"PTP_PRE_MASTER", 0x6AAED6},
    {"PTP_INITIALIZING", 0xC9B458},
    {"PTP_DISABLED", 0x606468},
    {"locked", 0x2A9D4A},
    {"recovered", 0x8FBF3F},
    {"starting", 0x9AA0A6},
    {"stopping", 0x606468},
    {"stale", 0xE08E0B},
    {"unmeasured", 0x3B7DD8},
    {"lost", 0x8E5EA2},
    {"dead", 0xC0392B},
}};

/// For labels that are not in the table, by their number.
constexpr std::array<unsigned, 5> otherColours{0x17A2B8, 0xD6568A, 0x7F5539, 0x6B8E23, 0x4B4BC8};

unsigned colourOf(const std::vector<std::string>& labels, const std::string& label) {
    const auto* known = std::find_if(colours.begin(), colours.end(),
                                     [&](const Colour& colour) { return colour.label == label; });
    if (known != colours.end()) {
        return known->value;
    }
    const auto number = std::find(labels.begin(), labels.end(), label) - labels.begin();
    return otherColours[static_cast<std::size_t>(number) % otherColours.size()];
}

} // namespace

std::string timeLineFigure(const Caption& caption, const TimeLine& timeLine, const TimeAxis& axis) {
    const auto labels = labelsOf(timeLine);
    const auto count = timeLine.rows.size();
    std::string names;
    for (std::size_t row = 0; row < count; ++row) {
        names += fmt::format("set label \"{}\" at graph 0, first {}.3 left offset 0.5,0\n",
                             rowName(timeLine.rows[row]), count - row);
    }
    return draw(caption, 140 + 36 * count, [&](const Canvas& canvas) {
        std::string data;
        for (const auto& span : timeLine.spans) {
            const auto y = static_cast<double>(count - span.row);
            const double begin = axis.at(span.begin);
            const double end = axis.at(std::max(span.end, span.begin + axis.pixel(canvas)));
            data += fmt::format("{0:.9g} {1} {0:.9g} {2:.9g} {3} {4} {5}\n", begin, y, end, y - 0.4,
                                y + 0.05, colourOf(labels, span.label));
        }
        return axis.commands(canvas) + names +
               fmt::format("set yrange [0.5:{}.6]\nunset ytics\n$data << END\n{}END\n"
                           "plot $data using 1:2:3:4:5:6:7 with boxxyerror lc rgb variable "
                           "fill solid noborder\n",
                           count, data);
    });
}

std::string timeLineLegend(const TimeLine& timeLine) {
    const auto labels = labelsOf(timeLine);
    std::vector<LegendEntry> entries;
    entries.reserve(labels.size());
    for (const auto& label : labels) {
        entries.push_back({colourOf(labels, label), label});
    }
    return legend(entries);
}

} // namespace vantelhost
