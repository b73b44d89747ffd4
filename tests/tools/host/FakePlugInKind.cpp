// What the fake plug-ins differ in: the version of their interface, and whether they can be
// stopped.

#include <cstdint>

#include <vantel_bc/zekeltr.h>

#include "FakePlugIn.h"

#define EXPORT __attribute__((visibility("default")))

extern "C" {

EXPORT std::uint32_t zekeltr_getAPIVersion() {
    return FAKE_API_VERSION;
}

#ifndef FAKE_WITHOUT_STOP
EXPORT void zekeltr_stop(void** slot) {
    stopFake(slot);
}
#endif

} // extern "C"
