#include "Checks/InterfaceChecks.h"

#include <cerrno>
#include <map>
#include <vector>

#include <fmt/format.h>
#include <linux/sockios.h>
#include <net/if.h>
#include <unistd.h>

#include "Checks/Access.h"
#include "Checks/DaemonChecks.h"
#include "Checks/InterfaceRequest.h"
#include "Text.h"

namespace vantelhost {

namespace {

/// Whether the daemon may get "-S", to take time stamps in software.
bool mayBeSoftware(const Subject& subject) {
    return subject.software || isScript(subject.daemon);
}

bool isThere(const std::string& interface) {
    return ::if_nametoindex(interface.c_str()) != 0;
}

/// The interfaces of each clock; those without one are left out.
std::map<int, std::vector<std::string>> clocksOf(const Subject& subject) {
    std::map<int, std::vector<std::string>> clocks;
    for (const auto& interface : subject.interfaces) {
        const auto timeStamping = subject.timeStamping(interface);
        if (timeStamping.error == 0 && timeStamping.clock >= 0) {
            clocks[timeStamping.clock].push_back(interface);
        }
    }
    return clocks;
}

/// Where those in hardware lack something.
Finding checkSoftware(const TimeStamping& timeStamping, const std::string& missingInHardware,
                      const std::string& mend) {
    const std::string missing = missingForSoftware(timeStamping);
    return missing.empty()
               ? doubtful("in software, if ptp4l is called with -S; in hardware, missing: " +
                              missingInHardware,
                          mend)
               : bad(fmt::format("missing in hardware: {}; in software: {}", missingInHardware,
                                 missing),
                     "use another interface");
}

} // namespace

Finding checkInterface(const Subject& /*subject*/, const std::string& interface) {
    if (!isThere(interface)) {
        return bad(errorText(errno), "\"ip link\" shows the interfaces that there are");
    }
    InterfaceRequest request(interface);
    const int error = request.ask(SIOCGIFFLAGS);
    if (error != 0) {
        return doubtful(fmt::format("there; its state: {}", errorText(error)), "");
    }
    const auto flags = static_cast<unsigned>(request.get().ifr_flags);
    if ((flags & IFF_UP) == 0) {
        return doubtful("down", fmt::format("ip link set {} up", interface));
    }
    if ((flags & IFF_RUNNING) == 0) {
        return doubtful("up, without a carrier", "see to its cable or peer");
    }
    return good("up");
}

Finding checkTimeStamping(const Subject& subject, const std::string& interface) {
    const auto timeStamping = subject.timeStamping(interface);
    if (timeStamping.error == ENODEV) {
        return skipped("there is no such interface");
    }
    const bool software = mayBeSoftware(subject);
    const std::string mend =
        fmt::format("use an interface with a PTP hardware clock (\"ethtool -T {}\" shows it), or "
                    "let {} be a script that calls ptp4l with -S: time stamps in software",
                    interface, subject.daemon);
    if (timeStamping.error != 0) {
        return {software ? Verdict::warn : Verdict::fail, errorText(timeStamping.error), mend};
    }
    const std::string missing =
        missingForHardware(timeStamping, setting(subject, "networkTransport").value_or(""));
    if (missing.empty()) {
        return good("in hardware");
    }
    return software ? checkSoftware(timeStamping, missing, mend)
                    : bad("ptp4l is to take time stamps in hardware, missing: " + missing, mend);
}

Finding checkClockDevice(const Subject& subject, const std::string& interface) {
    const auto timeStamping = subject.timeStamping(interface);
    if (timeStamping.error != 0 || timeStamping.clock < 0) {
        return skipped("there is no PTP hardware clock");
    }
    const std::string path = fmt::format("{}/ptp{}", subject.dev, timeStamping.clock);
    if (!isAllowed(path, R_OK)) {
        const int error = errno;
        return doubtful(fmt::format("{}: {}; ptp4l does not open it here, but the host reads the "
                                    "time of its pairs there",
                                    path, errorText(error)),
                        error == ENOENT ? "let udev make it, or pass it into the container"
                                        : "give the host's user the right to read it");
    }
    return good(path);
}

Finding checkOneClock(const Subject& subject) {
    const auto clocks = clocksOf(subject);
    if (clocks.empty()) {
        return skipped("there is no PTP hardware clock");
    }
    if (clocks.size() == 1) {
        return good(fmt::format("ptp{}", clocks.begin()->first));
    }
    std::vector<std::string> shown;
    std::vector<std::string> sharing;
    for (const auto& [clock, interfaces] : clocks) {
        const std::string names = fmt::format("{}", fmt::join(interfaces, " "));
        shown.push_back(fmt::format("ptp{} of {}", clock, names));
        if (interfaces.size() > 1) {
            sharing.push_back(names);
        }
    }
    return {mayBeSoftware(subject) ? Verdict::warn : Verdict::fail,
            fmt::format("ptp4l would mix the times of different clocks without a word: {}",
                        fmt::join(shown, ", ")),
            fmt::format("use {}; \"ethtool -T\" shows an interface's clock",
                        sharing.empty() ? "one of them, or others that share a clock"
                                        : fmt::format("{}", fmt::join(sharing, " or ")))};
}

} // namespace vantelhost
