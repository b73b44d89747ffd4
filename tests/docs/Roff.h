/// @file
#pragma once

#include <string>

/// The text of a manual page as it is read: of the escapes, those that our pages use.
inline std::string unescapedRoff(std::string page) {
    static const char* const escapes[][2] = {{"\\-", "-"}, {"\\e", "\\"}, {"\\(aq", "'"}};
    for (const auto& escape : escapes) {
        const std::string written = escape[0];
        for (std::size_t at = page.find(written); at != std::string::npos;
             at = page.find(written, at + 1)) {
            page.replace(at, written.size(), escape[1]);
        }
    }
    return page;
}
