#include "errors/zesdbg_VarLine.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

void zesdbg_VarLine::append(std::string_view text) {
    const std::size_t size = std::min(text.size(), capacity_ - 1 - length_);
    std::memcpy(text_ + length_, text.data(), size);
    length_ += size;
    text_[length_] = '\0';
}

void zesdbg_VarLine::appendField(std::string_view text, std::size_t width) {
    for (std::size_t column = text.size(); column < width; ++column) {
        append(" ");
    }
    append(text.substr(text.size() - std::min(text.size(), width)));
}

void zesdbg_VarLine::appendFormatted(const char* format, std::va_list arguments) {
    const std::size_t room = capacity_ - length_;
    const int size = std::vsnprintf(text_ + length_, room, format, arguments);
    length_ += std::min(static_cast<std::size_t>(std::max(size, 0)), room - 1);
}
