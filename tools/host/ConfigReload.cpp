#include "ConfigReload.h"

#include <set>
#include <utility>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "UsageError.h"

namespace vantelhost {

namespace {

/// Options whose changes are those of the plug-in's settings.
bool makesSettings(const std::string& option) {
    return option == "interface" || option == "no-interfaces" || option == "set";
}

std::vector<std::string> changedOptions(const OptionValues& before, const OptionValues& now) {
    std::set<std::string> names;
    for (const auto& [from, to] : {std::pair(&before, &now), std::pair(&now, &before)}) {
        for (const auto& [name, values] : *from) {
            const auto other = to->find(name);
            if ((other == to->end() || other->second != values) && !makesSettings(name)) {
                names.insert(name);
            }
        }
    }
    return {names.begin(), names.end()};
}

std::string textOf(const ConfigChange& change) {
    if (!change.errors.empty()) {
        return fmt::format("refused, all stays as it was: {}", fmt::join(change.errors, "; "));
    }
    std::string text =
        change.settings ? "the plug-in gets new settings" : "the settings are the same";
    if (!change.startOnly.empty()) {
        text +=
            fmt::format("; changed, but needs a new start: {}", fmt::join(change.startOnly, ", "));
    }
    return text;
}

} // namespace

bool canReread(const SettingsOptions& options) {
    return !options.configFile.empty() && options.configFile != "-";
}

ConfigChange rereadConfig(const Words& commandLine, const RunConfig& inUse, const Schema& schema,
                          const Json& settings) {
    ConfigChange change;
    try {
        RunConfig next = readRunConfig(commandLine);
        if (!next.errors.empty()) {
            change.errors = std::move(next.errors);
            return change;
        }
        Settings completed = completeSettings(schema, userSettings(next.options, next.json));
        if (!completed.errors.empty()) {
            change.errors = std::move(completed.errors);
            return change;
        }
        change.warnings = std::move(completed.warnings);
        change.startOnly = changedOptions(inUse.values, next.values);
        if (completed.values != settings) {
            change.settings = std::move(completed.values);
        }
    } catch (const UsageError& error) {
        change.errors = {error.what()};
    }
    return change;
}

Event rereadEvent(const ConfigChange& change) {
    return {"reread",
            textOf(change),
            {{"changed", change.settings.has_value()},
             {"startOnly", change.startOnly},
             {"problems", change.errors}}};
}

} // namespace vantelhost
