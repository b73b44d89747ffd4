/// @file
#pragma once

#include <cstddef>
#include <istream>
#include <optional>
#include <string_view>
#include <vector>

namespace vantelhost {

/// Reads lines in large portions, however long they are.
class LineReader {
public:
    struct Line {
        std::string_view text;  ///< without its end; valid until the next one is read
        bool isWhole = true;    ///< its end is there
        bool isTooLong = false; ///< the text is empty
    };

    /// @param longest line that is not too long, octets
    LineReader(std::istream& stream, std::size_t longest);

    /// Nothing at the stream's end, and when reading fails: the stream is then bad.
    std::optional<Line> next();

private:
    bool fill();
    Line take(std::size_t length);
    Line takeLong();

    std::istream& stream_;
    std::vector<char> buffer_;
    std::string_view rest_; ///< of what is in the buffer
};

} // namespace vantelhost
