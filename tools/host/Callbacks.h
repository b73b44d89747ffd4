/// @file
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>

#include <vantel_bc/status.h>

#include "Journal.h"
#include "Moment.h"

namespace vantelhost {

/// Owns the session slot and answers the plug-in's calls (zekel.h), from any thread.
///
/// A call with a context that is not the slot, without a status or without its data is refused and
/// counted as an error. While an object lives, the exported functions call it; only one may live at
/// a time.
class Callbacks {
public:
    /// @param refuseWhileStopping answer ZEKEL_HOST_IS_STOPPING once stopping has begun.
    /// @param endsBySignal        whether a signal ends the run: what is told of quality and
    ///                            metadata then is expected. Called from any thread, as the next.
    /// @param now                 answers zekel_getTime: nanoseconds of the clock that pairs have
    ///                            their local times of
    Callbacks(
        Journal& journal, bool refuseWhileStopping,
        std::function<bool()> endsBySignal = [] { return false; },
        std::function<std::uint64_t()> now = realtimeNanoseconds);
    ~Callbacks();
    Callbacks(const Callbacks&) = delete;
    Callbacks& operator=(const Callbacks&) = delete;

    /// The object that lives, or null.
    static Callbacks* active();

    void** slot() { return &slot_; }

    void stoppingBegins() { stopping_ = true; }

    void getTime(void** context, std::uint64_t* time, zeerr_Status* status);
    void adjustTime(void** context, std::uint64_t referenceTime, std::uint64_t localTime,
                    zeerr_Status* status);
    void setTRQuality(void** context, const double* quality, const char* reason,
                      zeerr_Status* status);
    void updateMetaData(void** context, const char* metadataJson, zeerr_Status* status);

private:
    /// Whether to go on with a call; otherwise its status says why not.
    bool accepts(void** context, bool hasData, const char* function, zeerr_Status* status);
    void refuse(const char* function, const std::string& problem, zeerr_Status& status);

    Journal& journal_;
    const bool refuseWhileStopping_;
    const std::function<bool()> endsBySignal_;
    const std::function<std::uint64_t()> now_;
    std::atomic<bool> stopping_{false};
    void* slot_ = nullptr;
};

} // namespace vantelhost
