// The functions that the host calls. No exception leaves them.

#include <cstdint>
#include <cstring>
#include <memory>
#include <string>

#include <syslog.h>

#include <vantel_bc/zekeltr.h>

#include "errors/Exception.h"
#include "parameterSchema.h"
#include "tPtp4lTimeRef.h"

#define VANTEL_EXPORT __attribute__((visibility("default")))

namespace {

constexpr char protocolName[ZEKELTR_NAME_SIZE] = "IEEE 1588-2008 BC";

/// Runs a body unless the status already holds an error, and puts what it throws into the status.
template <typename Body>
void guarded(zeerr::Status& status, Body body) {
    if (zeerr::isError(status)) {
        return;
    }
    try {
        body();
    } catch (...) {
        zeerr::statusFromCurrentException(status);
    }
}

zekelVantel::tPtp4lTimeRef* sessionIn(void** sessionSlot) {
    return static_cast<zekelVantel::tPtp4lTimeRef*>(*sessionSlot);
}

/// As "%x" in log lines shows it: the low 32 bits.
unsigned int slotNumber(void** sessionSlot) {
    return static_cast<unsigned int>(reinterpret_cast<std::uintptr_t>(sessionSlot));
}

} // namespace

extern "C" {

VANTEL_EXPORT std::uint32_t zekeltr_getAPIVersion() {
    return ZEKELTR_API_VERSION;
}

VANTEL_EXPORT void zekeltr_initialize(void** sessionSlot, const char* protocolConfig,
                                      zeerr::Status* status) {
    guarded(*status, [&] {
        if (protocolConfig == nullptr) {
            zeerr::setError(*status, zeerr::site::configurationIsNull);
            return;
        }
        *sessionSlot =
            std::make_unique<zekelVantel::tPtp4lTimeRef>(sessionSlot, std::string(protocolConfig))
                .release();
    });
}

// [oddity slot-stays] The slot keeps its value: it is the host's, which also compares it.
VANTEL_EXPORT void zekeltr_finalize(void** sessionSlot) {
    zeerr::LocalStatus status;
    guarded(status, [&] { delete sessionIn(sessionSlot); });
}

VANTEL_EXPORT void zekeltr_start(void** sessionSlot, zeerr::Status* status) {
    guarded(*status, [&] { sessionIn(sessionSlot)->start(); });
}

VANTEL_EXPORT void zekeltr_stop(void** sessionSlot) {
    zeerr::LocalStatus status;
    guarded(status, [&] { sessionIn(sessionSlot)->stop(); });
    if (zeerr::isError(status)) {
        syslog(LOG_ERR, "Unable to stop vantel session %x, got err: %d", slotNumber(sessionSlot),
               status.code);
    }
}

VANTEL_EXPORT void zekeltr_getName(char* name) {
    std::memcpy(name, protocolName, sizeof(protocolName));
}

VANTEL_EXPORT void zekeltr_getParameterValidationData(zekeltr_Reallocate reallocate, char** buffer,
                                                      zeerr::Status* status) {
    guarded(*status, [&] {
        *buffer = reallocate(*buffer, zekelVantel::parameterSchemaSize);
        if (*buffer == nullptr) {
            zeerr::setError(*status, zeerr::site::schemaNotAllocated);
            return;
        }
        std::memcpy(*buffer, zekelVantel::parameterSchema, zekelVantel::parameterSchemaSize);
    });
}

} // extern "C"
