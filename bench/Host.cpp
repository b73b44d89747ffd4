#include "Host.h"

#include <atomic>
#include <ctime>
#include <stdexcept>

#include <vantel_bc/zekel.h>

namespace {

std::atomic<Host*> current{nullptr};

} // namespace

extern "C" {

[[gnu::visibility("default")]] void zekel_getTime(void** /*context*/, std::uint64_t* time,
                                                  zeerr_Status* /*status*/) {
    *time = Host::now();
    if (Host* const host = current.load()) {
        host->polled();
    }
}

[[gnu::visibility("default")]] void zekel_adjustTime(void** /*context*/,
                                                     std::uint64_t referenceTime,
                                                     std::uint64_t localTime,
                                                     zeerr_Status* /*status*/) {
    if (Host* const host = current.load()) {
        host->paired(referenceTime, localTime);
    }
}

[[gnu::visibility("default")]] void zekel_setTRQuality(void** /*context*/,
                                                       const double* /*quality*/,
                                                       const char* /*reason*/,
                                                       zeerr_Status* /*status*/) {}

[[gnu::visibility("default")]] void
zekel_updateMetaData(void** /*context*/, const char* /*metadataJson*/, zeerr_Status* /*status*/) {}

} // extern "C"

Host::Host() {
    Host* none = nullptr;
    if (!current.compare_exchange_strong(none, this)) {
        throw std::logic_error("there is a host already");
    }
}

Host::~Host() {
    current = nullptr;
}

std::uint64_t Host::now() {
    timespec time{};
    clock_gettime(CLOCK_REALTIME, &time);
    return static_cast<std::uint64_t>(time.tv_sec) * 1000000000U +
           static_cast<std::uint64_t>(time.tv_nsec);
}
