#include "Status/StatusText.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

#include <fmt/format.h>

#include "Events.h"
#include "Text.h"
#include "ViewLines.h"

namespace vantelhost {

namespace {

std::string row(const std::string& name, const std::string& text) {
    return fmt::format("{:<16}: {}\n", name, onOneLine(text));
}

std::string lastText(const Json& last) {
    return last.is_null()
               ? "none"
               : fmt::format("{}, {:.1f} s ago", shownOffset(last.at("offset").get<double>()),
                             last.at("age").get<double>());
}

/// Of |offset|, as whoever asks wants to know how far off it was.
std::string windowText(const Json& window) {
    if (window.is_null()) {
        return "none";
    }
    const double largest = std::max(std::abs(window.at("min").get<double>()),
                                    std::abs(window.at("max").get<double>()));
    return fmt::format("rms {}, max {} in {} pairs", shownOffset(window.at("rms").get<double>()),
                       shownOffset(largest), window.at("pairs").get<std::uint64_t>());
}

std::string qualityText(const Json& status) {
    const std::string quality = status.at("quality");
    return quality.empty()
               ? "none yet"
               : fmt::format("{} ({})", quality, status.at("qualityReason").get<std::string>());
}

std::string healthText(const Json& status) {
    const std::string reason = status.at("reason");
    return fmt::format("{} for {}{}", status.at("health").get<std::string>(),
                       shownHours(status.at("since").get<double>()),
                       reason.empty() ? "" : fmt::format(" ({})", reason));
}

std::string portRows(const Json& ports) {
    std::string rows;
    for (const auto& [name, port] : ports.items()) {
        rows += row(name, fmt::format("{} on {}", shownMember(port, "portState"),
                                      shownMember(port, "interface")));
    }
    return rows.empty() ? row("Ports", "none") : rows;
}

std::string chronyText(const Json& chrony) {
    return chrony.is_null()
               ? "gets no pairs"
               : chronyEvent({chrony.at("sent"), chrony.at("failed"), chrony.at("withheld")},
                             chrony.at("problem"))
                     .text;
}

} // namespace

std::string statusText(const Json& status) {
    const Json& clocks = status.at("clocks");
    return row("Health", healthText(status)) + row("Quality", qualityText(status)) +
           row("Grandmaster", shownClock(clocks, "gmClockId", "gmClockClass", "gmClockAccuracy")) +
           row("This clock", shownClock(clocks, "localClockId", "clockClass", "clockAccuracy")) +
           row("Last offset", lastText(status.at("last"))) +
           row("Last minute", windowText(status.at("minute"))) +
           row("Last hour", windowText(status.at("hour"))) +
           row("Pairs", shownPairs(status.at("pairs"), status.at("leftOut"))) +
           portRows(status.at("ports")) + row("chronyd", chronyText(status.at("chrony"))) +
           row("Running",
               fmt::format("{}, {} restarts, {}", shownHours(status.at("uptime").get<double>()),
                           status.at("restarts").get<std::uint64_t>(),
                           status.at("plugIn").get<std::string>()));
}

} // namespace vantelhost
