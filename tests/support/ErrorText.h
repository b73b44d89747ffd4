/// @file
#pragma once

#include <string>

#include "errors/Status.h"

/// The whole JSON text of a status; "" when it has none.
inline std::string textOf(const zeerr::Status& status) {
    return status.json == nullptr ? "" : status.json;
}

/// The text that a host reads, written out with a writer of its own.
/// @param info "additionalInfo"; left out when empty.
inline std::string errorText(const std::string& constant, const std::string& file, int line,
                             const std::string& info = "") {
    std::string text = R"({"error_constant":")" + constant + R"(","file":")" + file +
                       R"(","line":)" + std::to_string(line) + R"(,"component":"vantel_bc")";
    if (!info.empty()) {
        text += R"(,"additionalInfo":")" + info + '"';
    }
    return text + '}';
}
