/// @file
#pragma once

#include <atomic>
#include <cstdint>
#include <future>
#include <memory>
#include <string>

#include "protocolConfig.h"
#include "sleepLength.h"
#include "tGetDataFromPtp4l.h"
#include "tHost.h"
#include "tPtp4lMetaData.h"
#include "tPtp4lProcess.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tSharedFifo.h"

namespace zekelVantel {

/// One session of the host: a boundary clock that is configured once, started once, and stopped.
///
/// A started session has two threads. The worker polls ptp4l and reports to the host, the watchdog
/// tells it when ptp4l dies. They share with the host's threads the stop flag; all else is written
/// before they start, or used by one of them alone.
class tPtp4lTimeRef {
public:
    /// Reads the configuration and writes ptp4l's configuration file.
    /// @param context the session slot's address, the host's name for this session.
    /// @throws as readProtocolConfig.
    tPtp4lTimeRef(void** context, const std::string& protocolConfig);

    /// Waits for the threads, which end only after stop.
    ~tPtp4lTimeRef();
    tPtp4lTimeRef(const tPtp4lTimeRef&) = delete;
    tPtp4lTimeRef& operator=(const tPtp4lTimeRef&) = delete;

    /// Sends default metadata and the quality "unusable", runs ptp4l and launches the threads.
    /// @throws zeerr::Exception when the host refuses or there can be no child; std::system_error
    ///         when there can be no thread. No thread and no ptp4l is left then.
    void start();

    /// Waits for the threads and ends ptp4l. May be repeated.
    void stop();

private:
    /// What a worker keeps from one pass to the next.
    struct tHistory {
        std::uint32_t sleep = longestSleep; ///< microseconds
        tTimeStatus timeStatus;
        tPtp4lMetaData metaData;
        std::uint64_t epochOffset = 0; ///< ns, the last one read
    };

    void runWorker();
    void runWatchdog();
    void waitForThreads() const;

    void runPass(tHistory& history);
    void reportUnreachable(std::int32_t code) const;
    void reportTimePair(const tTimeStatus& timeStatus, std::uint64_t& epochOffset);
    void drainEpochOffsets(std::uint64_t& epochOffset);
    void updateMetaData(const tPtp4lMetaData& metaData) const;

    // The members go in the reverse of this order.
    tHost host_;
    tProtocolConfig config_;
    std::atomic<bool> stopRequested_{false};
    tPtp4lProcess ptp4l_;
    std::future<void> watchdog_;
    std::future<void> worker_;
    std::shared_ptr<tSharedFifo> epochFifo_;
    std::shared_ptr<tGetDataFromPtp4l> poller_;
    std::string ptp4lPath_;
};

} // namespace zekelVantel
