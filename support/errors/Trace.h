/// @file
/// Trace lines for developers, on standard error.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace zesdbg {

/// Level of the traces of failures that are not reported otherwise.
inline constexpr std::uint32_t levelFailure = 0x2000;

/// A constant record of the place that traces.
struct Source {
    const char* file;
    int line;
    const char* suffix; ///< ends the line: a line feed
};

/// A line under construction: 512 octets, cut at the end, always zero-terminated.
class VarLineToBuffer {
public:
    static constexpr std::size_t capacity = 512;

    void append(std::string_view text);

    /// Appends the text right-aligned in a field. [oddity field-tail] A longer text keeps its end:
    /// of a path, the file name is worth more than the folders.
    void appendField(std::string_view text, std::size_t width);

    [[gnu::format(printf, 2, 0)]] void appendFormatted(const char* format, va_list arguments);

    const char* text() const { return text_; }

private:
    char text_[capacity] = {};
    std::size_t length_ = 0;
};

using PrefixWriter = void (*)(VarLineToBuffer& line, const Source& source);
using OutputHook = void (*)(const char* line);

/// Process-wide settings; the plug-in leaves them at their defaults.
struct Settings {
    std::uint32_t threshold;           ///< lines of lower levels are dropped
    std::size_t componentWidth;        ///< columns
    std::size_t fileWidth;             ///< columns
    std::size_t lineWidth;             ///< columns
    const PrefixWriter* prefixWriters; ///< ends with a null pointer
    OutputHook output;                 ///< takes the finished line
};
extern Settings settings;

/// Writes one line: "[component|file|line] ", the message, the source's suffix.
[[gnu::format(printf, 3, 4)]] void trace(std::uint32_t level, const Source& source,
                                         const char* format, ...);

} // namespace zesdbg
