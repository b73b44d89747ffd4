#include "ViewLines.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

using Lines = std::vector<std::string>;

constexpr std::size_t labelWidth = 14;
constexpr char missing[] = "...";

/// Lines under one label, which stands before the first.
void add(Lines& lines, const std::string& label, const Lines& texts) {
    for (const auto& text : texts) {
        lines.push_back(
            fmt::format("{:<{}}{}", &text == &texts.front() ? label : "", labelWidth, text));
    }
}

std::string printable(const std::string& text) {
    std::string result = onOneLine(text);
    std::replace_if(
        result.begin(), result.end(),
        [](char each) { return static_cast<unsigned char>(each) >= 0x80; }, '?');
    return result;
}

/// What of a line there is room for beside the labels.
std::size_t roomOf(ScreenSize size) {
    return size.columns > labelWidth ? size.columns - labelWidth : 0;
}

std::string withoutEnd(std::string text, std::size_t columns) {
    const std::size_t mark = sizeof(missing) - 1;
    if (text.size() > columns) {
        text.resize(columns);
        text.replace(columns > mark ? columns - mark : 0, mark, missing, std::min(columns, mark));
    }
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

/// Both ends say something: what it is, and why.
std::string withoutMiddle(const std::string& text, std::size_t columns) {
    const std::size_t mark = sizeof(missing) + 1; // with a space at each side
    if (text.size() <= columns || columns < 4 * mark) {
        return text;
    }
    const std::size_t tail = (columns - mark) / 2;
    const std::size_t head = columns - mark - tail;
    return fmt::format("{} {} {}", text.substr(0, head), missing, text.substr(text.size() - tail));
}

/// At spaces, where there are some.
Lines wrapped(std::string text, std::size_t columns) {
    constexpr std::size_t narrowest = 20;
    Lines lines;
    while (text.size() > columns && columns >= narrowest) {
        const auto space = text.rfind(' ', columns);
        const auto end = space == std::string::npos || space == 0 ? columns : space;
        lines.push_back(text.substr(0, end));
        text.erase(0, end == space ? end + 1 : end);
    }
    lines.push_back(text);
    return lines;
}

std::string headText(const ViewState& state, double now) {
    std::string text =
        fmt::format("{}, {}, up {}", state.plugIn,
                    state.phase == "running" ? state.health : state.phase, shownHours(now));
    if (state.restarts > 0) {
        text += fmt::format(", {} restart{}", state.restarts, state.restarts == 1 ? "" : "s");
    }
    return text;
}

/// Why not all is well; empty when it is.
std::string healthText(const ViewState& state, double now) {
    if (state.health == "locked" || state.healthReason.empty() || state.phase != "running") {
        return {};
    }
    return fmt::format("{} for {}: {}", state.health, shownHours(now - state.healthSince),
                       state.healthReason);
}

std::string qualityText(const ViewState& state, double now) {
    if (state.quality.empty()) {
        return "none yet";
    }
    return fmt::format("{} for {}: {}", state.quality, shownHours(now - state.qualitySince),
                       state.daemonEnd.empty() ? state.reason : state.daemonEnd);
}

std::string offsetText(const ViewState& state, double now) {
    constexpr double fresh = 3;
    if (!state.offset) {
        return "none yet";
    }
    const std::string offset = shownOffset(static_cast<double>(*state.offset));
    const double age = now - state.offsetSeconds;
    return age < fresh ? offset : fmt::format("{}, {} ago", offset, shownHours(age));
}

/// What the other rows do not tell by themselves; empty when there is nothing.
std::string hintText(const ViewState& state, double now) {
    constexpr double patience = 5;
    const bool isUsable = state.quality == "usable";
    if (isUsable && state.allOffsets.count == 0 && now > state.qualitySince + patience) {
        return "no time pairs though the quality is usable: no epoch FIFO? Or, in ptp4l's log, "
               "\"SYNC without timestamp\"?";
    }
    return {};
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
            texts.push_back(fmt::format("{:<7} {:<17} {}", name, shownMember(port, "portState"),
                                        shownMember(port, "interface")));
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

Lines problemTexts(const ViewState& state, double now, std::size_t room) {
    Lines texts;
    for (auto each = state.problems.rbegin(); each != state.problems.rend(); ++each) {
        const std::string times = each->times > 1 ? fmt::format("{} times, ", each->times) : "";
        texts.push_back(
            withoutMiddle(fmt::format("{}{} ago  {}", times, shownHours(now - each->seconds),
                                      printable(each->text)),
                          room));
    }
    return texts.empty() ? Lines{"none"} : texts;
}

} // namespace

std::string shownHours(double seconds) {
    const auto whole = static_cast<std::int64_t>(std::max(seconds, 0.0));
    return fmt::format("{}:{:02}:{:02}", whole / 3600, whole / 60 % 60, whole % 60);
}

std::string shownClock(const Json& metadata, const char* identity, const char* clockClass,
                       const char* accuracy) {
    if (metadata.empty()) {
        return "none yet";
    }
    return fmt::format("{}, class {}, {}", shownMember(metadata, identity),
                       shownMember(metadata, clockClass), shownMember(metadata, accuracy));
}

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
    Lines before{headText(state, now)};
    const std::size_t room = roomOf(size);
    if (const std::string health = healthText(state, now); !health.empty()) {
        add(before, "health", wrapped(printable(health), room));
    }
    add(before, "quality", wrapped(printable(qualityText(state, now)), room));
    add(before, "grandmaster",
        {shownClock(state.metadata, "gmClockId", "gmClockClass", "gmClockAccuracy")});
    add(before, "this clock",
        {shownClock(state.metadata, "localClockId", "clockClass", "clockAccuracy")});
    add(before, "offset", {offsetText(state, now)});
    add(before, fmt::format("last {:.0f} s", state.offsets.length()), {windowText(state, now)});
    add(before, "pairs", {shownPairs(state.allOffsets.count, state.leftOut)});
    if (const std::string hint = hintText(state, now); !hint.empty()) {
        add(before, "hint", wrapped(hint, room));
    }
    Lines after;
    if (!state.chrony.empty()) {
        add(after, "chronyd", {state.chrony});
    }
    add(after, "last errors", problemTexts(state, now, room));

    const auto others = before.size() + after.size();
    const auto ports = portTexts(state.metadata);
    add(before, "ports",
        ports.empty() ? Lines{"none"} : cutTo(ports, size.rows > others ? size.rows - others : 1));
    before.insert(before.end(), after.begin(), after.end());
    before.resize(std::min(before.size(), size.rows));
    for (auto& line : before) {
        line = withoutEnd(printable(line), size.columns);
    }
    return before;
}

} // namespace vantelhost
