/// @file
#pragma once

#include <array>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include <vantel_bc/zekel.h>

/// The host's four functions: records every call, and answers as it is told. One at a time.
class RecordingHost {
public:
    enum class Function { getTime, adjustTime, setTRQuality, updateMetaData };

    struct Call {
        Function function{};
        void** context = nullptr;
        std::int32_t codeOnEntry = 0;
        bool textOnEntry = false;
        std::uint64_t timeOnEntry = 0;
        std::uint64_t referenceTime = 0;
        std::uint64_t localTime = 0;
        std::array<double, ZEKEL_QUALITY_LENGTH> quality{};
        std::string text; ///< the reason, or the metadata
        std::thread::id thread;
        std::chrono::steady_clock::time_point at;
    };

    /// Called for each call after it was recorded, without a lock held: may fill the status or
    /// throw.
    using Reaction = std::function<void(const Call& call, zeerr_Status& status)>;

    RecordingHost();
    ~RecordingHost();
    RecordingHost(const RecordingHost&) = delete;
    RecordingHost& operator=(const RecordingHost&) = delete;

    void onCall(Reaction reaction);

    /// The time that zekel_getTime gives. A reaction may set it.
    void setTime(std::uint64_t time);

    std::vector<Call> calls() const;
    std::vector<Call> calls(Function function) const;

    /// Waits until a condition on the calls so far holds. @return false after the deadline.
    bool waitFor(const std::function<bool(const std::vector<Call>&)>& condition,
                 std::chrono::milliseconds deadline = std::chrono::seconds(20)) const;

    /// For the functions themselves.
    void record(const Call& call, std::uint64_t* time, zeerr_Status* status);

private:
    mutable std::mutex mutex_;
    mutable std::condition_variable changed_;
    std::vector<Call> calls_;
    Reaction reaction_;
    std::uint64_t time_ = 0;
};
