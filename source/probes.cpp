#include "probes.h"

#include <cinttypes>

#include "errors/Trace.h"

// One event: a trace line, and a probe point where the build found <sys/sdt.h>. A macro, for the
// point's name is part of it.
#ifdef VANTEL_HAVE_SYS_SDT_H
#define SDT_USE_VARIADIC
#include <sys/sdt.h>
#define VANTEL_PROBE_POINT(name, ...) STAP_PROBEV(vantel_bc, name, __VA_ARGS__)
#else
#define VANTEL_PROBE_POINT(name, ...) static_cast<void>(0)
#endif
#define VANTEL_EVENT(name, format, ...)                                                            \
    VANTEL_PROBE_POINT(name, __VA_ARGS__);                                                         \
    if (zesdbg::isTraced(levelEvent)) {                                                            \
        zesdbg::trace(levelEvent, {"probes", __LINE__, "\n"}, format, __VA_ARGS__);                \
    }

namespace zekelVantel {

tExchangeProbe::tExchangeProbe(std::uint16_t managementId, std::uint16_t sequenceId,
                               const zeerr::Status& status)
    : managementId_(managementId), sequenceId_(sequenceId), status_(status) {
    VANTEL_EVENT(exchange__start, "exchange start: managementId 0x%04x, sequenceId %u",
                 managementId_, sequenceId_);
}

tExchangeProbe::~tExchangeProbe() {
    VANTEL_EVENT(exchange__end, "exchange end: managementId 0x%04x, sequenceId %u, code %" PRId32,
                 managementId_, sequenceId_, status_.code);
}

void probeSleep(std::uint32_t microseconds) {
    VANTEL_EVENT(sleep__chosen, "sleep chosen: %" PRIu32 " us", microseconds);
}

void probeOffsets(std::size_t octets, std::int64_t kept) {
    VANTEL_EVENT(offsets__drained, "offsets drained: %zu octets, kept %" PRId64 " ns", octets,
                 kept);
}

void probeHostCall(const char* function, std::int32_t code) {
    VANTEL_EVENT(host__call, "host call: %s, code %" PRId32, function, code);
}

} // namespace zekelVantel
