#include "errors/Trace.h"

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <cstring>

#include "errors/ErrorSites.h"

namespace zesdbg {
namespace {

constexpr PrefixWriter defaultPrefix[] = {
    [](VarLineToBuffer& line, const Source&) { line.append("["); },
    [](VarLineToBuffer& line, const Source&) {
        line.appendField(zeerr::component, settings.componentWidth);
    },
    [](VarLineToBuffer& line, const Source&) { line.append("|"); },
    [](VarLineToBuffer& line, const Source& source) {
        line.appendField(source.file, settings.fileWidth);
    },
    [](VarLineToBuffer& line, const Source&) { line.append("|"); },
    [](VarLineToBuffer& line, const Source& source) {
        char digits[16];
        std::snprintf(digits, sizeof(digits), "%d", source.line);
        line.appendField(digits, settings.lineWidth);
    },
    [](VarLineToBuffer& line, const Source&) { line.append("] "); },
    nullptr};

void writeToStandardError(const char* line) {
    std::fputs(line, stderr);
}

} // namespace

Settings settings{0x1000, 10, 32, 4, defaultPrefix, &writeToStandardError};

void VarLineToBuffer::append(std::string_view text) {
    const std::size_t size = std::min(text.size(), capacity - 1 - length_);
    std::memcpy(text_ + length_, text.data(), size);
    length_ += size;
}

void VarLineToBuffer::appendField(std::string_view text, std::size_t width) {
    for (std::size_t column = text.size(); column < width; ++column) {
        append(" ");
    }
    append(text.substr(text.size() - std::min(text.size(), width)));
}

void VarLineToBuffer::appendFormatted(const char* format, va_list arguments) {
    const std::size_t room = capacity - length_;
    const int size = std::vsnprintf(text_ + length_, room, format, arguments);
    length_ += std::min(static_cast<std::size_t>(std::max(size, 0)), room - 1);
}

void trace(std::uint32_t level, const Source& source, const char* format, ...) {
    if (level < settings.threshold) {
        return;
    }
    VarLineToBuffer line;
    for (const PrefixWriter* writer = settings.prefixWriters; *writer != nullptr; ++writer) {
        (*writer)(line, source);
    }
    std::va_list arguments;
    va_start(arguments, format);
    line.appendFormatted(format, arguments);
    va_end(arguments);
    line.append(source.suffix);
    settings.output(line.text());
}

} // namespace zesdbg
