/// @file
/// The four functions that the host exports and the plug-in calls.
///
/// The host defines them with these unmangled names and makes them visible to the libraries it
/// loads (for an executable: link with `-rdynamic`).
///
/// Common rules:
/// - `context` is the address of the session slot that the host passed to `zekeltr_initialize`.
/// - `status` is fresh on entry (code 0, no text). The host reports a failure by making the code
///   negative and filling the text through `status->resize`. The plug-in releases the text.
/// - A code of ZEKEL_HOST_IS_STOPPING says that the host is going down.
/// - A C++ exception that leaves a function counts as an error of that call.
/// - Calls of one session may come from two threads at the same time. A call should return soon:
///   `zekeltr_stop` waits for calls that are under way. It must not start, stop or finalize its
///   session.
#ifndef VANTEL_BC_ZEKEL_H
#define VANTEL_BC_ZEKEL_H

#include <stdint.h>

#include "quality.h"
#include "status.h"

#ifdef __cplusplus
extern "C" {
#endif

/// Gives the host's present time.
/// @param time out, zeroed by the plug-in before the call: nanoseconds on the time base of ptp4l's
///             ingress time stamps.
void zekel_getTime(void** context, uint64_t* time, zeerr_Status* status);

/// Takes one time pair: at the same instant the reference showed `referenceTime` and the local
/// clock `localTime`, both in nanoseconds modulo 2^64.
void zekel_adjustTime(void** context, uint64_t referenceTime, uint64_t localTime,
                      zeerr_Status* status);

/// Takes the quality of the time reference: one of the two records of quality.h.
/// @param reason zero-terminated text, valid during the call.
void zekel_setTRQuality(void** context, const double* quality, const char* reason,
                        zeerr_Status* status);

/// Takes the description of grandmaster, local clock and ports as one JSON object.
/// @param metadataJson zero-terminated text, valid during the call.
void zekel_updateMetaData(void** context, const char* metadataJson, zeerr_Status* status);

#ifdef __cplusplus
}
#endif

#endif
