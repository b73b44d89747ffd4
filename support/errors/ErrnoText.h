/// @file
#pragma once

#include <cerrno>
#include <cstring>

namespace zeerr {

/// The present errno and its strerror text, kept before anything else can change them. Safe on any
/// thread.
class ErrnoText {
public:
    ErrnoText() : number_(errno), text_(strerror_r(number_, buffer_, sizeof(buffer_))) {}
    ErrnoText(const ErrnoText&) = delete;
    ErrnoText& operator=(const ErrnoText&) = delete;

    int number() const { return number_; }
    const char* text() const { return text_; }

private:
    int number_;
    char buffer_[128] = {};
    const char* text_;
};

} // namespace zeerr
