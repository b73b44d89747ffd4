#include "Callbacks.h"

#include <utility>

#include <fmt/format.h>

#include "HostStatus.h"

namespace vantelhost {

namespace {

std::atomic<Callbacks*> activeCallbacks{nullptr};

} // namespace

Callbacks::Callbacks(Journal& journal, bool refuseWhileStopping, std::function<bool()> endsBySignal,
                     std::function<std::uint64_t()> now)
    : journal_(journal),
      refuseWhileStopping_(refuseWhileStopping),
      endsBySignal_(std::move(endsBySignal)),
      now_(std::move(now)) {
    activeCallbacks = this;
}

Callbacks::~Callbacks() {
    activeCallbacks = nullptr;
}

Callbacks* Callbacks::active() {
    return activeCallbacks;
}

void Callbacks::getTime(void** context, std::uint64_t* time, zeerr_Status* status) {
    if (accepts(context, time != nullptr, "zekel_getTime", status)) {
        *time = now_();
        journal_.timeRequest();
    }
}

void Callbacks::adjustTime(void** context, std::uint64_t referenceTime, std::uint64_t localTime,
                           zeerr_Status* status) {
    if (accepts(context, true, "zekel_adjustTime", status)) {
        journal_.pair(referenceTime, localTime);
    }
}

void Callbacks::setTRQuality(void** context, const double* quality, const char* reason,
                             zeerr_Status* status) {
    const bool hasData = quality != nullptr && reason != nullptr;
    if (accepts(context, hasData, "zekel_setTRQuality", status)) {
        journal_.quality(quality, reason, endsBySignal_());
    }
}

void Callbacks::updateMetaData(void** context, const char* metadataJson, zeerr_Status* status) {
    if (accepts(context, metadataJson != nullptr, "zekel_updateMetaData", status)) {
        journal_.metadata(metadataJson, endsBySignal_());
    }
}

bool Callbacks::accepts(void** context, bool hasData, const char* function, zeerr_Status* status) {
    if (status == nullptr) {
        journal_.error(failureEvent(function, "called without a status"));
        return false;
    }
    if (status->code < 0) {
        return false;
    }
    if (context != &slot_) {
        refuse(function, fmt::format("called with the unknown context {}", fmt::ptr(context)),
               *status);
        return false;
    }
    if (!hasData) {
        refuse(function, "called with a null pointer", *status);
        return false;
    }
    if (refuseWhileStopping_ && stopping_) {
        journal_.refusal(function);
        fail(*status, ZEKEL_HOST_IS_STOPPING, "ZEKEL_HOST_IS_STOPPING", "the host is stopping");
        return false;
    }
    return true;
}

void Callbacks::refuse(const char* function, const std::string& problem, zeerr_Status& status) {
    journal_.error(failureEvent(function, problem));
    fail(status, invalidParameter, "zeoskerr_invalidParameter",
         fmt::format("{}: {}", function, problem));
}

} // namespace vantelhost
