#include "json/ClassicLocale.h"

namespace zekelVantel {

// Without memory for the locale, the host's stays.
ClassicLocale::ClassicLocale()
    : classic_(newlocale(LC_ALL_MASK, "C", nullptr)), previous_(uselocale(classic_)) {}

ClassicLocale::~ClassicLocale() {
    uselocale(previous_);
    if (classic_ != nullptr) {
        freelocale(classic_);
    }
}

} // namespace zekelVantel
