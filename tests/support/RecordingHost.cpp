#include "support/RecordingHost.h"

#include <algorithm>
#include <atomic>
#include <iterator>
#include <stdexcept>
#include <utility>

#include "support/OwnAllocations.h"

namespace {

std::atomic<RecordingHost*> currentHost{nullptr};

RecordingHost::Call entry(RecordingHost::Function function, void** context,
                          const zeerr_Status* status) {
    RecordingHost::Call call;
    call.function = function;
    call.context = context;
    call.codeOnEntry = status->code;
    call.textOnEntry = status->json != nullptr;
    call.thread = std::this_thread::get_id();
    call.at = std::chrono::steady_clock::now();
    return call;
}

void record(const RecordingHost::Call& call, std::uint64_t* time, zeerr_Status* status) {
    if (RecordingHost* const host = currentHost.load()) {
        host->record(call, time, status);
    }
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] void zekel_getTime(void** context, std::uint64_t* time,
                                                  zeerr_Status* status) {
    const OwnAllocations own;
    RecordingHost::Call call = entry(RecordingHost::Function::getTime, context, status);
    call.timeOnEntry = *time;
    record(call, time, status);
}

[[gnu::visibility("default")]] void zekel_adjustTime(void** context, std::uint64_t referenceTime,
                                                     std::uint64_t localTime,
                                                     zeerr_Status* status) {
    const OwnAllocations own;
    RecordingHost::Call call = entry(RecordingHost::Function::adjustTime, context, status);
    call.referenceTime = referenceTime;
    call.localTime = localTime;
    record(call, nullptr, status);
}

[[gnu::visibility("default")]] void zekel_setTRQuality(void** context, const double* quality,
                                                       const char* reason, zeerr_Status* status) {
    const OwnAllocations own;
    RecordingHost::Call call = entry(RecordingHost::Function::setTRQuality, context, status);
    std::copy_n(quality, ZEKEL_QUALITY_LENGTH, call.quality.begin());
    call.text = reason;
    record(call, nullptr, status);
}

[[gnu::visibility("default")]] void zekel_updateMetaData(void** context, const char* metadataJson,
                                                         zeerr_Status* status) {
    const OwnAllocations own;
    RecordingHost::Call call = entry(RecordingHost::Function::updateMetaData, context, status);
    call.text = metadataJson;
    record(call, nullptr, status);
}

} // extern "C"

RecordingHost::RecordingHost() {
    RecordingHost* none = nullptr;
    if (!currentHost.compare_exchange_strong(none, this)) {
        throw std::logic_error("there is a host already");
    }
}

RecordingHost::~RecordingHost() {
    currentHost = nullptr;
}

void RecordingHost::onCall(Reaction reaction) {
    const std::lock_guard<std::mutex> lock(mutex_);
    reaction_ = std::move(reaction);
}

void RecordingHost::setTime(std::uint64_t time) {
    const std::lock_guard<std::mutex> lock(mutex_);
    time_ = time;
}

std::vector<RecordingHost::Call> RecordingHost::calls() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return calls_;
}

std::vector<RecordingHost::Call> RecordingHost::calls(Function function) const {
    const std::lock_guard<std::mutex> lock(mutex_);
    std::vector<Call> chosen;
    std::copy_if(calls_.begin(), calls_.end(), std::back_inserter(chosen),
                 [&](const Call& call) { return call.function == function; });
    return chosen;
}

bool RecordingHost::waitFor(const std::function<bool(const std::vector<Call>&)>& condition,
                            std::chrono::milliseconds deadline) const {
    std::unique_lock<std::mutex> lock(mutex_);
    return changed_.wait_for(lock, deadline, [&] { return condition(calls_); });
}

void RecordingHost::record(const Call& call, std::uint64_t* time, zeerr_Status* status) {
    Reaction reaction;
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        calls_.push_back(call);
        reaction = reaction_;
    }
    changed_.notify_all();
    if (reaction) {
        reaction(call, *status);
    }
    if (time != nullptr) {
        const std::lock_guard<std::mutex> lock(mutex_);
        *time = time_;
    }
}
