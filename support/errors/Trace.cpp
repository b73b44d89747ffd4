#include "errors/Trace.h"

#include <cstdarg>
#include <cstdio>

#include "errors/ErrorSites.h"
#include "errors/zesdbg_VarLineToBuffer.h"

namespace zesdbg {
namespace {

constexpr PrefixWriter defaultPrefix[] = {
    [](zesdbg_VarLine& line, const Source&) { line.append("["); },
    [](zesdbg_VarLine& line, const Source&) {
        line.appendField(zeerr::component, settings.componentWidth);
    },
    [](zesdbg_VarLine& line, const Source&) { line.append("|"); },
    [](zesdbg_VarLine& line, const Source& source) {
        line.appendField(source.file, settings.fileWidth);
    },
    [](zesdbg_VarLine& line, const Source&) { line.append("|"); },
    [](zesdbg_VarLine& line, const Source& source) {
        char digits[16];
        std::snprintf(digits, sizeof(digits), "%d", source.line);
        line.appendField(digits, settings.lineWidth);
    },
    [](zesdbg_VarLine& line, const Source&) { line.append("] "); },
    nullptr};

[[gnu::format(printf, 2, 0)]] void appendFormatted(zesdbg_VarLine& line, const char* format,
                                                   std::va_list arguments) {
    line.appendFormatted(format, arguments);
}

void writeToStandardError(const char* line) {
    std::fputs(line, stderr);
}

} // namespace

Settings settings{0x1000, 10, 32, 4, defaultPrefix, &appendFormatted, &writeToStandardError};

void trace(std::uint32_t level, const Source& source, const char* format, ...) {
    if (!isTraced(level)) {
        return;
    }
    zesdbg_VarLineToBuffer line;
    for (const PrefixWriter* writer = settings.prefixWriters; *writer != nullptr; ++writer) {
        (*writer)(line, source);
    }
    std::va_list arguments;
    va_start(arguments, format);
    settings.formatter(line, format, arguments);
    va_end(arguments);
    line.append(source.suffix);
    settings.output(line.text());
}

} // namespace zesdbg
