/// @file
#pragma once

#include <dlfcn.h>

/// The function that one of this program's stands before: the C library's, or a sanitizer's.
template <typename Function>
Function* nextFunction(const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}
