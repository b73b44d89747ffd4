/// @file
/// The seven functions that the plug-in exports.
///
/// The host owns one pointer-sized slot per session. The address of the slot identifies the session
/// in every call, in both directions.
///
/// Order: `zekeltr_initialize`, `zekeltr_start`, `zekeltr_stop`, `zekeltr_finalize`, once each; the
/// other three at any time. The functions are not serialised: start, stop and finalize of one
/// session must not overlap, nor be called from a callback of it. No exception leaves them.
#ifndef VANTEL_BC_ZEKELTR_H
#define VANTEL_BC_ZEKELTR_H

#include <stddef.h>
#include <stdint.h>

#include "status.h"

/// The version that `zekeltr_getAPIVersion` returns.
#define ZEKELTR_API_VERSION 2

/// Octets that `zekeltr_getName` writes, the terminating zero included.
#define ZEKELTR_NAME_SIZE 18

#ifdef __cplusplus
extern "C" {
#endif

/// Resizes a buffer of the host as realloc does. May return null; `buffer` may be null.
typedef char* (*zekeltr_Reallocate)(char* buffer, size_t size);

/// @return ZEKELTR_API_VERSION.
uint32_t zekeltr_getAPIVersion(void);

/// Creates a session from the protocol configuration and writes ptp4l's configuration file.
/// @param sessionSlot    receives the session; not written on failure.
/// @param protocolConfig JSON object text; copied.
/// @param status         in and out. A negative code on entry: nothing happens. Codes on failure:
///                       -52005 a null configuration, JSON that does not parse, a missing key;
///                       -52004 a value of the wrong type; -52003 a number out of range, or a
///                       transportSpecific that is no hexadecimal number; -52000 no memory.
void zekeltr_initialize(void** sessionSlot, const char* protocolConfig, zeerr_Status* status);

/// Destroys the session, if `*sessionSlot` is not null, and leaves the slot as it is. A started
/// session must be stopped first: otherwise this waits for ever.
void zekeltr_finalize(void** sessionSlot);

/// Starts the session: sends default metadata and the quality "unusable", runs ptp4l, and begins to
/// report. The slot must hold a session.
/// @param status in and out. A negative code on entry: nothing happens. Codes on failure: -52008
///               ptp4l could not be forked; -52003 no thread; -52000 no memory; or the code of a
///               host call that failed.
void zekeltr_start(void** sessionSlot, zeerr_Status* status);

/// Stops the session: waits for its threads and ends ptp4l. The slot must hold a session. A failure
/// is written to the system log only.
void zekeltr_stop(void** sessionSlot);

/// Writes the name of the time reference.
/// @param name room for at least ZEKELTR_NAME_SIZE octets.
void zekeltr_getName(char* name);

/// Hands out the JSON schema of the parameters.
/// @param reallocate called once, with `*buffer` and the exact size of the text with its
/// terminating
///                   zero.
/// @param buffer     in and out: receives what `reallocate` returned, null included, then the text.
/// @param status     in and out. A negative code on entry: nothing happens. -52000 when
/// `reallocate`
///                   returned null.
void zekeltr_getParameterValidationData(zekeltr_Reallocate reallocate, char** buffer,
                                        zeerr_Status* status);

#ifdef __cplusplus
}
#endif

#endif
