#include "SchemaTable.h"

#include <algorithm>
#include <array>
#include <cstdio>

#include <fmt/format.h>

#include "Events.h"
#include "HostStatus.h"
#include "PlugIn.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

using Row = std::array<std::string, 5>;

Row row(const Parameter& parameter) {
    const auto& range = parameter.range;
    return {parameter.key, nameOf(parameter.type),
            range ? fmt::format("{} to {}", range->low, range->high) : "",
            toAscii(parameter.defaultValue), parameter.hidden ? "yes" : "no"};
}

std::string shownStatus(const HostStatus& status) {
    return statusEvent("schema", status.code(), status.text()).text;
}

} // namespace

std::string schemaTable(const Schema& schema) {
    std::vector<Row> rows{{"key", "type", "range", "default", "hidden"}};
    for (const auto& parameter : schema) {
        rows.push_back(row(parameter));
    }
    std::array<std::size_t, 5> widths{};
    for (const auto& each : rows) {
        for (std::size_t i = 0; i < each.size(); ++i) {
            widths[i] = std::max(widths[i], each[i].size());
        }
    }
    std::string table;
    for (const auto& each : rows) {
        std::string line;
        for (std::size_t i = 0; i < each.size(); ++i) {
            line += fmt::format("{:<{}}  ", each[i], widths[i]);
        }
        line.erase(line.find_last_not_of(' ') + 1);
        table += onOneLine(line) + "\n";
    }
    return table;
}

int showSchema(const SchemaOptions& options) {
    const PlugIn plugIn(options.pluginPath);
    HostStatus status;
    const std::string text = plugIn.schema(status);
    if (status.isError()) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(shownStatus(status)));
        return exitFailed;
    }
    try {
        const std::string shownText = options.raw ? text : schemaTable(parseSchema(text));
        std::fputs(shownText.c_str(), stdout);
        return std::fflush(stdout) == 0 ? exitClean : exitFailed;
    } catch (const SchemaError& error) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error.what()));
        return exitFailed;
    }
}

} // namespace vantelhost
