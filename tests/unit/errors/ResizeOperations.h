/// @file
/// Resize operations as hosts may write them.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <stdexcept>
#include <string>
#include <vector>

#include "errors/Status.h"

/// The sizes that the operations below were asked for, since the last test began.
inline std::vector<std::uint32_t> requestedSizes;

inline bool releaseText(zeerr::Status* status) {
    std::free(status->json);
    status->json = nullptr;
    status->capacity = 0;
    return true;
}

/// Allocates exactly what was asked for.
inline bool reallocate(zeerr::Status* status, std::uint32_t size, int filler, bool keepText) {
    if (size == 0) {
        return releaseText(status);
    }
    char* const text = static_cast<char*>(std::malloc(size));
    std::memset(text, filler, size);
    if (keepText && status->json != nullptr) {
        std::memcpy(text, status->json, std::min(size, status->capacity));
    }
    std::free(status->json);
    status->json = text;
    status->capacity = size;
    return true;
}

/// Keeps the text, leaves the new memory as it was, and records what was asked for.
inline bool countingResize(zeerr::Status* status, std::uint32_t size) {
    requestedSizes.push_back(size);
    return reallocate(status, size, 0xa5, true);
}

inline bool refusingResize(zeerr::Status* status, std::uint32_t size) {
    requestedSizes.push_back(size);
    return size == 0 && releaseText(status);
}

/// Has room for 64 octets and no more.
inline bool smallResize(zeerr::Status* status, std::uint32_t size) {
    return size <= 64 && reallocate(status, size == 0 ? 0 : 64, 0xa5, true);
}

inline bool notGrowingResize(zeerr::Status* status, std::uint32_t size) {
    requestedSizes.push_back(size);
    return size != 0 || releaseText(status);
}

inline bool forgettingResize(zeerr::Status* status, std::uint32_t) {
    return releaseText(status);
}

inline bool garbageResize(zeerr::Status* status, std::uint32_t size) {
    return reallocate(status, size, 0xa5, false);
}

inline bool zeroingResize(zeerr::Status* status, std::uint32_t size) {
    return reallocate(status, size, 0, false);
}

inline bool throwingResize(zeerr::Status* status, std::uint32_t size) {
    if (size != 0) {
        throw std::runtime_error("no");
    }
    return releaseText(status);
}

/// A status with the resize operation of a host.
class HostStatus : public zeerr::Status {
public:
    explicit HostStatus(zeerr_Resize operation) : Status{0, 0, operation, nullptr} {
        requestedSizes.clear();
    }

    /// Starts with a text in a buffer of its own.
    HostStatus(zeerr_Resize operation, const std::string& text, std::uint32_t room)
        : HostStatus(operation) {
        json = static_cast<char*>(std::malloc(room));
        std::memset(json, 0xa5, room);
        std::memcpy(json, text.c_str(), text.size() + 1);
        capacity = room;
    }

    ~HostStatus() { releaseText(this); }
    HostStatus(const HostStatus&) = delete;
    HostStatus& operator=(const HostStatus&) = delete;
};
