#include "errors/Status.h"

#include <cstring>
#include <memory>
#include <new>
#include <utility>

namespace zeerr {
namespace {

constexpr char emptyObject[] = "{}";
constexpr std::uint32_t smallestCapacity = 512;

std::uint32_t capacityFor(std::uint32_t size) {
    std::uint32_t capacity = smallestCapacity;
    while (capacity < size) {
        capacity *= 2;
    }
    return capacity;
}

void resetText(Status& status) {
    if (status.json == nullptr || status.capacity == 0) {
        return;
    }
    if (status.capacity >= sizeof(emptyObject)) {
        std::memcpy(status.json, emptyObject, sizeof(emptyObject));
    } else {
        status.json[0] = '\0';
    }
}

/// The operation may be the host's: whatever it throws is a refusal.
bool callResize(Status& status, std::uint32_t size) noexcept {
    try {
        return status.resize != nullptr && status.resize(&status, size);
    } catch (...) {
        return false;
    }
}

} // namespace

bool defaultResize(Status* status, std::uint32_t size) {
    if (size == 0) {
        delete[] status->json;
        status->json = nullptr;
        status->capacity = 0;
        return true;
    }
    if (size <= status->capacity) {
        return true;
    }
    if (static_cast<std::int32_t>(size) < 0) {
        return false;
    }
    const std::uint32_t capacity = capacityFor(size);
    std::unique_ptr<char[]> text(new (std::nothrow) char[capacity]);
    if (text == nullptr) {
        return false;
    }
    if (status->json != nullptr) {
        const std::uint32_t length = textLength(*status);
        std::memcpy(text.get(), status->json, length);
        text[length] = '\0';
    } else {
        std::memcpy(text.get(), emptyObject, sizeof(emptyObject));
    }
    delete[] status->json;
    status->json = text.release();
    status->capacity = capacity;
    return true;
}

bool resize(Status& status, std::uint32_t size) {
    const std::uint32_t length = textLength(status);
    if (!callResize(status, size) || status.json == nullptr || status.capacity < size) {
        return false;
    }
    if (length == 0) {
        resetText(status);
    } else if (length < status.capacity) {
        status.json[length] = '\0';
    }
    return true;
}

void release(Status& status) {
    callResize(status, 0);
}

bool setCode(Status& status, std::int32_t code) {
    const bool accepted = status.code == 0 ? code != 0 : status.code > 0 && code < 0;
    if (accepted) {
        status.code = code;
        resetText(status);
    }
    return accepted;
}

bool copyText(Status& target, const Status& source) {
    if (source.json == nullptr) {
        return true;
    }
    const std::uint32_t length = textLength(source);
    if (!resize(target, length + 1)) {
        return false;
    }
    std::memcpy(target.json, source.json, length);
    target.json[length] = '\0';
    return true;
}

bool merge(Status& target, Status& source, bool* changed) {
    bool complete = true;
    const bool accepted = setCode(target, source.code);
    if (accepted && target.resize == source.resize) {
        release(target);
        target.json = std::exchange(source.json, nullptr);
        target.capacity = std::exchange(source.capacity, 0U);
    } else if (accepted) {
        complete = copyText(target, source);
    }
    if (changed != nullptr) {
        *changed = complete;
    }
    return accepted;
}

std::uint32_t textLength(const Status& status) {
    if (status.json == nullptr) {
        return 0;
    }
    return static_cast<std::uint32_t>(strnlen(status.json, status.capacity));
}

} // namespace zeerr
