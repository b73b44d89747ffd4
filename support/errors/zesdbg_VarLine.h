/// @file
#pragma once

#include <cstdarg>
#include <cstddef>
#include <string_view>

/// A line under construction in memory of its user: cut at the end, always zero-terminated.
class zesdbg_VarLine {
public:
    /// @param text empty; stays the user's
    /// @param capacity octets of it, at least 1
    zesdbg_VarLine(char* text, std::size_t capacity) : text_(text), capacity_(capacity) {}

    void append(std::string_view text);

    /// Appends the text right-aligned in a field. [oddity field-tail] A longer text keeps its end:
    /// of a path, the file name is worth more than the folders.
    void appendField(std::string_view text, std::size_t width);

    [[gnu::format(printf, 2, 0)]] void appendFormatted(const char* format, std::va_list arguments);

    const char* text() const { return text_; }

private:
    char* text_;
    std::size_t capacity_;
    std::size_t length_ = 0;
};
