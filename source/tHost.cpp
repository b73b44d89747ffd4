#include "tHost.h"

#include <exception>

#include <vantel_bc/zekel.h>

#include "errors/Exception.h"
#include "probes.h"

namespace zekelVantel {
namespace {

constexpr double usable[ZEKEL_QUALITY_LENGTH] = ZEKEL_QUALITY_USABLE;
constexpr double unusable[ZEKEL_QUALITY_LENGTH] = ZEKEL_QUALITY_UNUSABLE;

template <typename Function, typename... Arguments>
void call(const char* name, Function function, Arguments... arguments) {
    zeerr::LocalStatus status;
    function(arguments..., &status);
    probeHostCall(name, status.code);
    if (std::uncaught_exceptions() == 0) {
        zeerr::throwIfError(status);
    }
}

} // namespace

std::uint64_t tHost::getTime() const {
    std::uint64_t time = 0;
    call("zekel_getTime", &zekel_getTime, context_, &time);
    return time;
}

void tHost::adjustTime(std::uint64_t referenceTime, std::uint64_t localTime) const {
    call("zekel_adjustTime", &zekel_adjustTime, context_, referenceTime, localTime);
}

void tHost::setQuality(tQuality quality, const char* reason) const {
    call("zekel_setTRQuality", &zekel_setTRQuality, context_,
         quality == tQuality::usable ? usable : unusable, reason);
}

void tHost::updateMetaData(const char* metadataJson) const {
    call("zekel_updateMetaData", &zekel_updateMetaData, context_, metadataJson);
}

} // namespace zekelVantel
