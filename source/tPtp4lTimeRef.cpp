#include "tPtp4lTimeRef.h"

#include <chrono>
#include <thread>
#include <utility>

#include <syslog.h>

#include "errors/Exception.h"
#include "paths.h"
#include "probes.h"

namespace zekelVantel {
namespace {

constexpr char waitingForStatus[] = "Waiting for ptp4l status";
constexpr char processHasDied[] = "PTP sub process has died unexpectedly";
constexpr char unableToCommunicate[] =
    "Unable to communicate with PTP sub process while attempting to retrieve time data";
constexpr char roleHasChanged[] = "PTP role has changed.";

std::shared_ptr<tSharedFifo> makeEpochFifo() {
    zeerr::LocalStatus status;
    auto fifo = std::make_shared<tSharedFifo>(epochFifoPath, false, status);
    zeerr::throwIfError(status);
    return fifo;
}

/// In a catch-all handler: a host that is stopping refuses calls, which is no error.
void logHostFailure(const char* failure) {
    zeerr::LocalStatus status;
    zeerr::statusFromCurrentException(status);
    if (status.code == ZEKEL_HOST_IS_STOPPING) {
        syslog(LOG_INFO, "KEL is stopping, ignoring the error: %d", status.code);
    } else {
        syslog(LOG_ERR, "%s%d", failure, status.code);
    }
}

} // namespace

tPtp4lTimeRef::tPtp4lTimeRef(void** context, const std::string& protocolConfig)
    : host_(context), epochFifo_(makeEpochFifo()), ptp4lPath_(ptp4lPath) {
    readProtocolConfig(config_, protocolConfig);
    poller_ = std::make_shared<tGetDataFromPtp4l>(
        config_.udsAddress, static_cast<std::uint8_t>(config_.transportSpecific & 0xff));
}

// [oddity finalize-waits] A session that was never stopped is waited for: its threads use it.
tPtp4lTimeRef::~tPtp4lTimeRef() {
    waitForThreads();
}

void tPtp4lTimeRef::start() {
    updateMetaData(tPtp4lMetaData());
    host_.setQuality(tQuality::unusable, waitingForStatus);
    stopRequested_ = false;
    ptp4l_.spawn(ptp4lPath_, config_.configFile, config_.interfaces);
    try {
        worker_ = std::async(std::launch::async, &tPtp4lTimeRef::runWorker, this);
        watchdog_ = std::async(std::launch::async, &tPtp4lTimeRef::runWatchdog, this);
    } catch (...) {
        stop();
        throw;
    }
}

void tPtp4lTimeRef::stop() {
    stopRequested_ = true;
    waitForThreads();
    ptp4l_.terminate();
}

void tPtp4lTimeRef::waitForThreads() const {
    if (worker_.valid()) {
        worker_.wait();
    }
    if (watchdog_.valid()) {
        watchdog_.wait();
    }
}

void tPtp4lTimeRef::runWatchdog() {
    while (!stopRequested_) {
        try {
            std::this_thread::sleep_for(std::chrono::seconds(1));
            // [oddity gone-is-dead] A child that waitpid does not know counts as dead, too: it
            // cannot be told apart from one that was reaped, and retries rely on it.
            if (ptp4l_.hasDied()) {
                host_.setQuality(tQuality::unusable, processHasDied);
                return;
            }
        } catch (...) {
            logHostFailure(
                "PTP4l process has died, watchdog unable to set quality to unusable,got error: ");
        }
    }
}

void tPtp4lTimeRef::runWorker() {
    tHistory history;
    while (!stopRequested_) {
        try {
            runPass(history);
        } catch (...) {
            logHostFailure("Unable to call into KEL in vantel, got error: ");
            history.sleep = longestSleep;
        }
    }
}

void tPtp4lTimeRef::runPass(tHistory& history) {
    probeSleep(history.sleep);
    std::this_thread::sleep_for(std::chrono::microseconds(history.sleep));
    tTimeStatus timeStatus;
    tPtp4lMetaData metaData;
    if (const std::int32_t code = poller_->fetch(timeStatus, metaData); code != 0) {
        reportUnreachable(code);
        return;
    }
    history.sleep =
        sleepLength(host_.getTime(), static_cast<std::uint64_t>(timeStatus.ingressTime));
    if (timeStatus.gmPresent != history.timeStatus.gmPresent) {
        host_.setQuality(timeStatus.gmPresent == 0 ? tQuality::unusable : tQuality::usable,
                         roleHasChanged);
    }
    // [oddity pair-of-1970] Also when it becomes 0, as it does when the grandmaster goes.
    if (timeStatus.ingressTime != history.timeStatus.ingressTime) {
        reportTimePair(timeStatus, history.epochOffset);
    }
    if (metaData != history.metaData) {
        updateMetaData(metaData);
        history.metaData = std::move(metaData);
    }
    history.timeStatus = timeStatus;
}

// [oddity silent-recovery] The history stays as it is: after a recovery the host is told only what
// differs from the last good poll, so it keeps "unusable" until the next change of role.
void tPtp4lTimeRef::reportUnreachable(std::int32_t code) const {
    // [oddity unreachable-is-info] LOG_INFO: while ptp4l starts this is expected.
    syslog(
        LOG_INFO,
        "Unable to communicate with PTP sub process while attempting to retrieve data,got error: "
        "%d",
        code);
    host_.setQuality(tQuality::unusable, unableToCommunicate);
    updateMetaData(tPtp4lMetaData());
}

// [oddity offset-of-before] Before ptp4l knows a delay, its offset is still the one of before;
// nothing in its answers tells.
void tPtp4lTimeRef::reportTimePair(const tTimeStatus& timeStatus, std::uint64_t& epochOffset) {
    drainEpochOffsets(epochOffset);
    const std::uint64_t offset = epochOffset + static_cast<std::uint64_t>(timeStatus.masterOffset);
    const std::uint64_t localTime =
        static_cast<std::uint64_t>(timeStatus.ingressTime) + epochOffset;
    host_.adjustTime(localTime - offset, localTime);
}

// At most one pipe full, so that a writer that never pauses cannot hold the worker.
void tPtp4lTimeRef::drainEpochOffsets(std::uint64_t& epochOffset) {
    zeerr::LocalStatus status;
    std::uint64_t value = 0;
    std::size_t capacity = 0;
    std::size_t octets = 0;
    while (epochFifo_->read(&value, sizeof(value), status) == sizeof(value)) {
        epochOffset = value;
        octets += sizeof(value);
        if (capacity == 0) {
            capacity = epochFifo_->capacity();
        }
        if (octets >= capacity) {
            break;
        }
    }
    probeOffsets(octets, static_cast<std::int64_t>(epochOffset));
    // [oddity no-fifo-no-pairs] A missing FIFO is an error: without the epoch, a pair would be
    // wrong.
    if (status.code != zeerr::code::endOfData) {
        zeerr::throwIfError(status);
    }
}

void tPtp4lTimeRef::updateMetaData(const tPtp4lMetaData& metaData) const {
    const std::string json = metaData.toJson();
    syslog(LOG_INFO, "update Meta Data: %s", json.c_str());
    host_.updateMetaData(json.c_str());
}

} // namespace zekelVantel
