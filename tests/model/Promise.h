/// @file
#pragma once

#include <cstdio>
#include <string>

#include <unistd.h>

/// Ends this process, which then says on stderr what the library did and should not have done. At
/// once: threads of the library may run on, and use what would be destroyed on the way out.
[[noreturn]] inline void promiseIsBroken(const std::string& how) {
    std::fprintf(stderr, "%s\n", how.c_str());
    _exit(1);
}

inline void expect(bool holds, const std::string& otherwise) {
    if (!holds) {
        promiseIsBroken(otherwise);
    }
}
