/// @file
/// Writing members into the JSON text of a status.
///
/// A write position points at the closing brace of the object that is being written. Every writer
/// takes a position and gives the next one, or null when memory ran out; a null position is passed
/// on, so that calls can be chained and checked once. A failure never takes the code away: only the
/// text is short.
#pragma once

#include <string>
#include <string_view>

#include "errors/Status.h"

namespace zeerr {

/// Lets the writers grow the text of one status through the resize operation it carries.
class Resizer {
public:
    explicit Resizer(Status& status) : status_(status) {}

    /// Makes room for `octets` more at `position`, and moves the rest of the text, the terminating
    /// zero included, behind them.
    /// @return the same position in the text, which may have moved, or null.
    char* insert(char* position, std::size_t octets);

private:
    bool grow();

    Status& status_;
};

/// Makes room for at least 2 more octets and finds where members are to be added.
/// @return the closing brace of the top-level object (the bracket, if the text is an array), or
/// null
///         when the text is neither or does not scan.
char* beginMembers(Status& status);

/// Adds a string member, escaped.
char* addString(char* position, std::string_view key, std::string_view value, Resizer& resizer);

/// Adds an integer member.
char* addInt(char* position, std::string_view key, int value, Resizer& resizer);

/// Adds an empty object. @return a position inside it.
char* addObject(char* position, std::string_view key, Resizer& resizer);

/// Steps behind the closing brace of the object that was being written.
char* leaveObject(char* position);

/// Adds "file", "line" and, if `component` is not null, "component".
char* addSourceLocation(char* position, std::string_view file, int line, const char* component,
                        Resizer& resizer);

/// Escapes a text for use between the quotes of a JSON string: the quote, the backslash and the
/// control characters 8, 9, 10, 12 and 13 with two characters, the other control characters and 127
/// with six ("\\u%04x"). Everything else stays as it is.
std::string escaped(std::string_view text);

} // namespace zeerr
