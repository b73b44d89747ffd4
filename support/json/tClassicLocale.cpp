#include "json/tClassicLocale.h"

namespace zekelVantel {

// Without memory for the locale, the host's stays.
tClassicLocale::tClassicLocale()
    : classic_(newlocale(LC_ALL_MASK, "C", nullptr)), previous_(uselocale(classic_)) {}

tClassicLocale::~tClassicLocale() {
    uselocale(previous_);
    if (classic_ != nullptr) {
        freelocale(classic_);
    }
}

} // namespace zekelVantel
