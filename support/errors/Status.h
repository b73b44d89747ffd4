/// @file
/// Operations on the error status that the host and the plug-in share.
#pragma once

#include <cstdint>

#include <vantel_bc/status.h>

namespace zeerr {

/// Below 0: the operation failed.
inline bool isError(const Status& status) {
    return status.code < 0;
}

/// Exactly 0: neither error nor warning.
inline bool isClean(const Status& status) {
    return status.code == 0;
}

/// The plug-in's own resize operation. Capacities are 512 or the smallest power of two that fits; a
/// size with the top bit set fails.
bool defaultResize(Status* status, std::uint32_t size);

/// Calls the resize operation that the status carries.
/// @return false when there is none, when it refuses, or when it reports success without room for
///         `size` octets. Otherwise a text shorter than the capacity is zero-terminated, whatever
///         the resize operation left in the new memory.
bool resize(Status& status, std::uint32_t size);

/// Releases the text. The code stays.
void release(Status& status);

/// The priority rule: a code is accepted into a clean status if it is not 0, and into a status that
/// holds a warning if it is an error. On acceptance an existing text is reset to "{}".
/// @return true when accepted: the caller then writes the members.
bool setCode(Status& status, std::int32_t code);

/// Moves an outcome from `source` to `target`, if `setCode` accepts it. The text moves when both
/// share the resize operation, else it is copied.
/// @param changed if given, set to true; to false when the code was accepted and the copy of the
/// text
///                failed.
/// @return what `setCode` returned.
bool merge(Status& target, Status& source, bool* changed = nullptr);

/// Replaces the text of `target` by a copy of the source's, if there is one, through the target's
/// resize operation.
/// @return false when there is no room: the target keeps the text it had.
bool copyText(Status& target, const Status& source);

/// Length of the text, never beyond its capacity; 0 when there is none.
std::uint32_t textLength(const Status& status);

/// A fresh status on the stack, with the plug-in's own resize operation, that releases its text.
class LocalStatus : public Status {
public:
    LocalStatus() : Status(Status{0, 0, &defaultResize, nullptr}) {}
    ~LocalStatus() {
        // Mostly there is no text, and no host put an operation of its own here.
        if (json != nullptr || resize != &defaultResize) {
            release(*this);
        }
    }
    LocalStatus(const LocalStatus&) = delete;
    LocalStatus& operator=(const LocalStatus&) = delete;
};

} // namespace zeerr
