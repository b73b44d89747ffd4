// The functions that the plug-in calls. No exception leaves them.

#include <vantel_bc/zekel.h>

#include "Callbacks.h"
#include "HostStatus.h"

#define VANTEL_HOST_EXPORT __attribute__((visibility("default")))

namespace {

using vantelhost::Callbacks;

template <typename Call>
void answer(zeerr_Status* status, Call call) noexcept {
    try {
        if (auto* callbacks = Callbacks::active()) {
            call(*callbacks);
        } else if (status != nullptr && status->code >= 0) {
            vantelhost::fail(*status, vantelhost::invalidParameter, "zeoskerr_invalidParameter",
                             "there is no session");
        }
    } catch (...) {
        if (status != nullptr && status->code >= 0) {
            status->code = vantelhost::memoryFull;
        }
    }
}

} // namespace

extern "C" {

VANTEL_HOST_EXPORT void zekel_getTime(void** context, uint64_t* time, zeerr_Status* status) {
    answer(status, [&](Callbacks& callbacks) { callbacks.getTime(context, time, status); });
}

VANTEL_HOST_EXPORT void zekel_adjustTime(void** context, uint64_t referenceTime, uint64_t localTime,
                                         zeerr_Status* status) {
    answer(status, [&](Callbacks& callbacks) {
        callbacks.adjustTime(context, referenceTime, localTime, status);
    });
}

VANTEL_HOST_EXPORT void zekel_setTRQuality(void** context, const double* quality,
                                           const char* reason, zeerr_Status* status) {
    answer(status,
           [&](Callbacks& callbacks) { callbacks.setTRQuality(context, quality, reason, status); });
}

VANTEL_HOST_EXPORT void zekel_updateMetaData(void** context, const char* metadataJson,
                                             zeerr_Status* status) {
    answer(status,
           [&](Callbacks& callbacks) { callbacks.updateMetaData(context, metadataJson, status); });
}

} // extern "C"
