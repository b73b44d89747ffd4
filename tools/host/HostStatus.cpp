#include "HostStatus.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "Json.h"
#include "Text.h"

namespace vantelhost {

namespace {

constexpr char emptyObject[] = "{}";

void release(zeerr_Status& status) {
    std::free(status.json);
    status.json = nullptr;
    status.capacity = 0;
}

/// Never shrinks, so that the text is always kept whole.
bool resize(zeerr_Status* status, std::uint32_t size) {
    if (size == 0) {
        release(*status);
        return true;
    }
    if (status->json != nullptr && size <= status->capacity) {
        return true;
    }
    const auto wanted = std::max<std::uint32_t>(size, sizeof(emptyObject));
    auto* grown = static_cast<char*>(std::realloc(status->json, wanted));
    if (grown == nullptr) {
        return false;
    }
    if (status->json == nullptr) {
        std::memcpy(grown, emptyObject, sizeof(emptyObject));
    }
    status->json = grown;
    status->capacity = wanted;
    return true;
}

} // namespace

HostStatus::HostStatus() : status_{0, 0, resize, nullptr} {}

HostStatus::~HostStatus() {
    // The plug-in may have put a text of its own there: it goes to whoever owns it.
    if (status_.resize != nullptr) {
        status_.resize(&status_, 0);
    }
}

std::string HostStatus::text() const {
    return status_.json == nullptr ? std::string() : std::string(status_.json);
}

void fail(zeerr_Status& status, std::int32_t code, const char* constant, const std::string& info) {
    status.code = code;
    const std::string text = toAscii(Json{{"error_constant", constant},
                                          {"file", "Callbacks"},
                                          {"line", __LINE__},
                                          {"component", "vantel-host"},
                                          {"additionalInfo", info}});
    const auto size = static_cast<std::uint32_t>(std::uint64_t{text.size()} + 1);
    if (status.resize != nullptr && status.resize(&status, size)) {
        std::memcpy(status.json, text.c_str(), size);
    }
}

} // namespace vantelhost
