#include "Row.h"

#include <cstdio>

#include <fmt/format.h>

namespace {

std::string text(const std::optional<double>& number) {
    return number ? fmt::format("{:.6g}", *number) : "";
}

} // namespace

void print(const Row& row) {
    fmt::print("{}\t{}\t{:.6g}\t{}\t{}\t{}\n", row.figure, row.ports, row.value, row.unit,
               text(row.ratio), text(row.limit));
    std::fflush(stdout);
}
