#include "Report/LineReader.h"

#include <algorithm>
#include <cstring>

namespace vantelhost {

LineReader::LineReader(std::istream& stream, std::size_t longest)
    : stream_(stream), buffer_(longest + 1) {}

std::optional<LineReader::Line> LineReader::next() {
    for (;;) {
        const auto end = rest_.find('\n');
        if (end != std::string_view::npos) {
            return take(end);
        }
        if (rest_.size() == buffer_.size()) {
            return takeLong();
        }
        if (!fill()) {
            break;
        }
    }
    if (rest_.empty() || stream_.bad()) {
        return std::nullopt;
    }
    auto line = take(rest_.size());
    line.isWhole = false;
    return line;
}

/// @return whether more has come.
bool LineReader::fill() {
    if (!rest_.empty()) {
        std::memmove(buffer_.data(), rest_.data(), rest_.size());
    }
    char* const end = buffer_.data() + rest_.size();
    stream_.read(end, static_cast<std::streamsize>(buffer_.size() - rest_.size()));
    const auto count = static_cast<std::size_t>(stream_.gcount());
    rest_ = {buffer_.data(), rest_.size() + count};
    return count > 0;
}

LineReader::Line LineReader::take(std::size_t length) {
    const Line line{rest_.substr(0, length)};
    rest_.remove_prefix(std::min(length + 1, rest_.size()));
    return line;
}

/// Only its end is looked for.
LineReader::Line LineReader::takeLong() {
    Line line{{}, false, true};
    while (!line.isWhole) {
        const auto end = rest_.find('\n');
        line.isWhole = end != std::string_view::npos;
        rest_.remove_prefix(line.isWhole ? end + 1 : rest_.size());
        if (!line.isWhole && !fill()) {
            break;
        }
    }
    return line;
}

} // namespace vantelhost
