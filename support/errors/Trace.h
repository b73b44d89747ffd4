/// @file
/// Trace lines for developers, on standard error.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdint>

#include "errors/zesdbg_VarLine.h"

namespace zesdbg {

/// Level of the traces of failures that are not reported otherwise.
inline constexpr std::uint32_t levelFailure = 0x2000;

/// A constant record of the place that traces.
struct Source {
    const char* file;
    int line;
    const char* suffix; ///< ends the line: a line feed
};

using PrefixWriter = void (*)(zesdbg_VarLine& line, const Source& source);
using Formatter = void (*)(zesdbg_VarLine& line, const char* format, std::va_list arguments);
using OutputHook = void (*)(const char* line);

/// Process-wide settings; the plug-in leaves them at their defaults.
struct Settings {
    std::uint32_t threshold;           ///< lines of lower levels are dropped
    std::size_t componentWidth;        ///< columns
    std::size_t fileWidth;             ///< columns
    std::size_t lineWidth;             ///< columns
    const PrefixWriter* prefixWriters; ///< ends with a null pointer
    Formatter formatter;               ///< adds the message, printf-style
    OutputHook output;                 ///< takes the finished line
};
extern Settings settings;

/// Whether lines of that level are written.
inline bool isTraced(std::uint32_t level) {
    return level >= settings.threshold;
}

/// Writes one line: "[component|file|line] ", the message, the source's suffix.
[[gnu::format(printf, 3, 4)]] void trace(std::uint32_t level, const Source& source,
                                         const char* format, ...);

} // namespace zesdbg
