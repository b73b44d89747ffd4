/// @file
/// The error status that crosses the boundary between the host and the plug-in.
///
/// Usable from C (as `zeerr_Status`) and from C++ (as `zeerr::Status`, the same type).
#ifndef VANTEL_BC_STATUS_H
#define VANTEL_BC_STATUS_H

#include <stdbool.h>
#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
namespace zeerr {
struct Status;
}
typedef zeerr::Status zeerr_Status;
#else
typedef struct zeerr_Status zeerr_Status;
#endif

/// Resizes the JSON text of a status. A status carries the function that owns its text, so that a
/// text allocated by one module can be released by another.
///
/// @param status the status whose `json` and `capacity` are to change.
/// @param size   octets wanted, the terminating zero included. 0 releases the text: `json` becomes
///               null and `capacity` 0. Otherwise the text is kept, and `json` then has room for at
///               least `size` octets and `capacity` says for how many. A text that was null becomes
///               "{}".
/// @return false when there is no memory; the status is then unchanged.
typedef bool (*zeerr_Resize)(zeerr_Status* status, uint32_t size);

/// The outcome of one operation: a code and, for a failure, a JSON object that describes it.
///
/// A fresh status is { 0, 0, resize, NULL }. Whoever made the status releases its text, by calling
/// `resize(status, 0)`. A status belongs to one thread at a time.
///
/// The text is an object with the members "error_constant", "file", "line", "component" and, where
/// there is more to tell, "std_exception_what", "zesync_debug" and "additionalInfo".
///
/// Rules: an operation that finds `code` below 0 does nothing. The first error stays; an error
/// replaces a warning; nothing replaces an error.
#ifdef __cplusplus
struct zeerr::Status
#else
struct zeerr_Status
#endif
{
    int32_t code;        ///< 0 success, below 0 error, above 0 warning
    uint32_t capacity;   ///< octets allocated at `json`, 0 when there is no text
    zeerr_Resize resize; ///< owner of the text; may be null, then the status never gets a text
    char* json;          ///< zero-terminated JSON text, or null
};

/// The code with which a host refuses calls while it is stopping. The threads of a session log it
/// at LOG_INFO instead of LOG_ERR and go on; in `zekeltr_start` it is an error as any other. The
/// plug-in never sets it itself.
#define ZEKEL_HOST_IS_STOPPING (-52009)

#ifdef __cplusplus
static_assert(offsetof(zeerr::Status, code) == 0, "interface layout");
static_assert(offsetof(zeerr::Status, capacity) == 4, "interface layout");
static_assert(offsetof(zeerr::Status, resize) == 8, "interface layout");
static_assert(offsetof(zeerr::Status, json) == 8 + sizeof(void*), "interface layout");
static_assert(sizeof(zeerr::Status) == (sizeof(void*) == 4 ? 16 : 24), "interface layout");
#endif

#endif
