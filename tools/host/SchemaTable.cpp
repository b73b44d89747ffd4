#include "SchemaTable.h"

#include <algorithm>
#include <array>

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

using TableRow = std::array<std::string, 5>;

TableRow row(const Parameter& parameter) {
    const auto& range = parameter.range;
    return {parameter.key, nameOf(parameter.type),
            range ? fmt::format("{} to {}", range->low, range->high) : "",
            toAscii(parameter.defaultValue), parameter.hidden ? "yes" : "no"};
}

} // namespace

std::string schemaTable(const Schema& schema) {
    std::vector<TableRow> rows{{"key", "type", "range", "default", "hidden"}};
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

} // namespace vantelhost
