#include "SoakHost.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <stdexcept>
#include <thread>

#include <syslog.h>

#include "HostStatus.h"
#include "support/LogFunctions.h"

namespace {

std::atomic<SoakHost*> current{nullptr};

constexpr char unreachable[] =
    "Unable to communicate with PTP sub process while attempting to retrieve time data";
constexpr char died[] = "PTP sub process has died unexpectedly";
constexpr std::array reasons{unreachable, died, "Waiting for ptp4l status",
                             "PTP role has changed."};

bool isKnown(const char* reason) {
    return std::any_of(reasons.begin(), reasons.end(),
                       [&](const char* known) { return std::strcmp(known, reason) == 0; });
}

bool isRecord(const double* quality, const double (&record)[ZEKEL_QUALITY_LENGTH]) {
    return std::equal(quality, quality + ZEKEL_QUALITY_LENGTH, record);
}

void fail(zeerr_Status& status, int code) {
    vantelhost::fail(status, code, "soak", "as planned");
}

void count(int priority, const char* /*line*/) {
    if (SoakHost* const host = current.load()) {
        host->logged(priority);
    }
}

} // namespace

// Called by the plug-in.
extern "C" {

void zekel_getTime(void** context, std::uint64_t* time, zeerr_Status* status) {
    current.load()->getTime(context, time, *status);
}

void zekel_adjustTime(void** context, std::uint64_t /*referenceTime*/, std::uint64_t /*localTime*/,
                      zeerr_Status* status) {
    current.load()->adjustTime(context, *status);
}

void zekel_setTRQuality(void** context, const double* quality, const char* reason,
                        zeerr_Status* status) {
    current.load()->setQuality(context, quality, reason, *status);
}

void zekel_updateMetaData(void** context, const char* metadataJson, zeerr_Status* status) {
    current.load()->updateMetaData(context, metadataJson, *status);
}

} // extern "C"

SoakHost::SoakHost() : lastPoll_(Clock::now()) {
    current = this;
    setLogTaker(count);
}

SoakHost::~SoakHost() {
    current = nullptr;
}

void SoakHost::expect(void** slot) {
    slot_ = slot;
    usable_ = false;
    polled();
}

SoakHost::Counts SoakHost::counts() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return counts_;
}

std::string SoakHost::violation() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return violation_;
}

void SoakHost::getTime(void** context, std::uint64_t* time, zeerr_Status& status) {
    enter(context, status);
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    *time = static_cast<std::uint64_t>(std::chrono::nanoseconds(now).count());
    polled();
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        ++counts_.polls;
    }
    answer(status);
}

void SoakHost::adjustTime(void** context, zeerr_Status& status) {
    enter(context, status);
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        ++counts_.pairs;
    }
    answer(status);
}

void SoakHost::setQuality(void** context, const double* quality, const char* reason,
                          zeerr_Status& status) {
    enter(context, status);
    const bool usable = isRecord(quality, ZEKEL_QUALITY_USABLE);
    if (!usable && !isRecord(quality, ZEKEL_QUALITY_UNUSABLE)) {
        violated("an unknown quality");
    }
    if (!isKnown(reason)) {
        violated("an unknown reason");
    }
    if (std::strcmp(reason, unreachable) == 0) {
        polled();
    }
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        counts_.usable += usable ? 1 : 0;
        counts_.failed += std::strcmp(reason, unreachable) == 0 ? 1 : 0;
        counts_.deaths += std::strcmp(reason, died) == 0 ? 1 : 0;
    }
    answer(status);
    usable_ = usable;
}

void SoakHost::updateMetaData(void** context, const char* json, zeerr_Status& status) {
    enter(context, status);
    const std::size_t length = std::strlen(json);
    if (length < 2 || json[0] != '{' || json[length - 1] != '}') {
        violated("metadata that is no JSON object");
    }
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        ++counts_.metaData;
    }
    answer(status);
}

void SoakHost::logged(int priority) {
    const std::lock_guard<std::mutex> lock(mutex_);
    ++counts_.logLines;
    counts_.logErrors += priority <= LOG_ERR ? 1 : 0;
}

void SoakHost::enter(void** context, const zeerr_Status& status) {
    void** const slot = slot_;
    if (slot == nullptr) {
        violated("a call outside a session");
    } else if (context != slot) {
        violated("a foreign session slot");
    }
    if (status.code != 0 || status.json != nullptr || status.resize == nullptr) {
        violated("a status that is not fresh");
    }
}

void SoakHost::answer(zeerr_Status& status) {
    const HostFault fault = fault_;
    const unsigned dice = random();
    if (fault == HostFault::none || (fault != HostFault::refusal && dice % 2 == 0)) {
        return;
    }
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        ++counts_.misdeeds;
    }
    switch (fault) {
    case HostFault::error:
    case HostFault::refusal:
        return fail(status, -52008);
    case HostFault::stopping:
        return fail(status, ZEKEL_HOST_IS_STOPPING);
    case HostFault::warning:
        return fail(status, 1);
    case HostFault::exception:
        throw std::runtime_error("a host that throws");
    case HostFault::foreignException:
        throw 42;
    case HostFault::block:
        return std::this_thread::sleep_for(std::chrono::milliseconds(50 + dice % 950));
    case HostFault::none:
        return;
    }
}

void SoakHost::violated(const char* rule) {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (violation_.empty()) {
        violation_ = rule;
    }
}
