#include "ViewLines.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

using Lines = std::vector<std::string>;

/// Lines under one label, which stands before the first.
void add(Lines& lines, const std::string& label, const Lines& texts) {
    for (const auto& text : texts) {
        lines.push_back(fmt::format("{:<13} {}", &text == &texts.front() ? label : "", text));
    }
}

std::string shownDuration(double seconds) {
    const auto whole = static_cast<std::int64_t>(std::max(seconds, 0.0));
    return fmt::format("{}:{:02}:{:02}", whole / 3600, whole / 60 % 60, whole % 60);
}

std::string member(const Json& object, const char* key) {
    const auto found = object.find(key);
    if (found == object.end()) {
        return "?";
    }
    return found->is_string() ? found->get<std::string>() : shown(*found);
}

std::string qualityText(const ViewState& state, double now) {
    if (state.quality.empty()) {
        return "none yet";
    }
    return fmt::format("{} for {}: {}", state.quality, shownDuration(now - state.qualitySince),
                       state.reason);
}

std::string clockText(const Json& metadata, const char* identity, const char* clockClass,
                      const char* accuracy) {
    if (metadata.empty()) {
        return "none yet";
    }
    return fmt::format("{}, class {}, {}", member(metadata, identity), member(metadata, clockClass),
                       member(metadata, accuracy));
}

std::string offsetText(const ViewState& state) {
    return state.offset ? shownOffset(static_cast<double>(*state.offset)) : "none yet";
}

std::string windowText(const ViewState& state, double now) {
    const auto offsets = state.offsets.statistics(now);
    if (offsets.count == 0) {
        return "no pairs";
    }
    return fmt::format("min {}, max {}, rms {}, {:.1f} pairs/s",
                       shownOffset(static_cast<double>(offsets.smallest)),
                       shownOffset(static_cast<double>(offsets.largest)),
                       shownOffset(offsets.rms()), state.offsets.rate(now));
}

Lines portTexts(const Json& metadata) {
    Lines texts;
    for (const auto& [name, port] : metadata.items()) {
        if (port.is_object()) {
            texts.push_back(fmt::format("{:<7} {:<17} {}", name, member(port, "portState"),
                                        member(port, "interface")));
        }
    }
    return texts;
}

/// The last ones are left out for a line that says how many.
Lines cutTo(Lines texts, std::size_t most) {
    most = std::max<std::size_t>(most, 1);
    if (texts.size() > most) {
        const auto left = texts.size() - most + 1;
        texts.resize(most - 1);
        texts.push_back(fmt::format("{} more", left));
    }
    return texts;
}

Lines problemTexts(const ViewState& state, double now) {
    Lines texts;
    for (auto each = state.problems.rbegin(); each != state.problems.rend(); ++each) {
        texts.push_back(fmt::format("{} ago  {}", shownDuration(now - each->seconds), each->text));
    }
    return texts.empty() ? Lines{"none"} : texts;
}

std::string printable(const std::string& text, std::size_t columns) {
    std::string result;
    for (const char character : onOneLine(text)) {
        result += static_cast<unsigned char>(character) < 0x80 ? character : '?';
    }
    result.resize(std::min(result.size(), columns));
    result.erase(result.find_last_not_of(' ') + 1);
    return result;
}

} // namespace

std::string shownOffset(double nanoseconds) {
    struct Unit {
        const char* name;
        double size;
    };
    // Shown with three decimals, so that a little below the limit would be rounded up to it.
    constexpr double limit = 9999.9995;
    if (std::abs(nanoseconds) < limit) {
        return fmt::format("{:.0f} ns", nanoseconds);
    }
    for (const auto& unit : {Unit{"us", 1e3}, Unit{"ms", 1e6}}) {
        if (std::abs(nanoseconds) < limit * unit.size) {
            return fmt::format("{:.3f} {}", nanoseconds / unit.size, unit.name);
        }
    }
    return fmt::format("{:.3f} s", nanoseconds / 1e9);
}

std::vector<std::string> viewLines(const ViewState& state, double now, ScreenSize size) {
    Lines before{fmt::format("{}, {}, up {}", state.plugIn, state.phase, shownDuration(now))};
    add(before, "quality", {qualityText(state, now)});
    add(before, "grandmaster",
        {clockText(state.metadata, "gmClockId", "gmClockClass", "gmClockAccuracy")});
    add(before, "this clock",
        {clockText(state.metadata, "localClockId", "clockClass", "clockAccuracy")});
    add(before, "offset", {offsetText(state)});
    add(before, fmt::format("last {:.0f} s", state.offsets.length()), {windowText(state, now)});
    add(before, "pairs", {fmt::format("{}", state.pairs)});
    Lines after;
    if (!state.chrony.empty()) {
        add(after, "chronyd", {state.chrony});
    }
    add(after, "last errors", problemTexts(state, now));

    const auto others = before.size() + after.size();
    const auto ports = portTexts(state.metadata);
    add(before, "ports",
        ports.empty() ? Lines{"none"} : cutTo(ports, size.rows > others ? size.rows - others : 1));
    before.insert(before.end(), after.begin(), after.end());
    before.resize(std::min(before.size(), size.rows));
    for (auto& line : before) {
        line = printable(line, size.columns);
    }
    return before;
}

} // namespace vantelhost
