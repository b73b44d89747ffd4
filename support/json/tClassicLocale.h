/// @file
#pragma once

#include <locale.h>

namespace zekelVantel {

/// The "C" locale for the calling thread while this object lives. Parsing numbers and comparing
/// keys must not depend on the locale that the host has set.
class tClassicLocale {
public:
    tClassicLocale();
    ~tClassicLocale();
    tClassicLocale(const tClassicLocale&) = delete;
    tClassicLocale& operator=(const tClassicLocale&) = delete;

private:
    locale_t classic_;
    locale_t previous_;
};

} // namespace zekelVantel
