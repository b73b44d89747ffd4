#include "Checks/InterfaceChecks.h"

#include <cerrno>
#include <cstring>
#include <map>

#include <fmt/format.h>
#include <linux/sockios.h>
#include <net/if.h>
#include <unistd.h>

#include "Checks/Access.h"
#include "Checks/InterfaceRequest.h"

namespace vantelhost {

namespace {

bool isThere(const std::string& interface) {
    return ::if_nametoindex(interface.c_str()) != 0;
}

} // namespace

Finding checkInterface(const Subject&, const std::string& interface) {
    if (!isThere(interface)) {
        return bad(std::strerror(errno), "\"ip link\" shows the interfaces that there are");
    }
    InterfaceRequest request(interface);
    const int error = request.ask(SIOCGIFFLAGS);
    if (error != 0) {
        return doubtful(fmt::format("there; its state: {}", std::strerror(error)), "");
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
    const std::string mend = fmt::format(
        "use an interface with a PTP hardware clock (\"ethtool -T {}\" shows it)", interface);
    if (timeStamping.error != 0) {
        return bad(std::strerror(timeStamping.error), mend);
    }
    const std::string missing = missingForHardware(timeStamping);
    if (!missing.empty()) {
        return bad("ptp4l is to take time stamps in hardware, missing: " + missing, mend);
    }
    return good("in hardware");
}

Finding checkClockDevice(const Subject& subject, const std::string& interface) {
    const auto timeStamping = subject.timeStamping(interface);
    if (timeStamping.error != 0 || timeStamping.clock < 0) {
        return skipped("there is no PTP hardware clock");
    }
    const std::string path = fmt::format("{}/ptp{}", subject.dev, timeStamping.clock);
    if (!isAllowed(path, R_OK | W_OK)) {
        return bad(fmt::format("{}: {}", path, std::strerror(errno)),
                   errno == ENOENT ? "let udev make it, or pass it into the container"
                                   : "give the host's user the right to read and write it");
    }
    return good(path);
}

Finding checkOneClock(const Subject& subject) {
    std::map<int, std::string> interfacesOf;
    for (const auto& interface : subject.interfaces) {
        const auto timeStamping = subject.timeStamping(interface);
        if (timeStamping.error == 0 && timeStamping.clock >= 0) {
            auto& names = interfacesOf[timeStamping.clock];
            names += (names.empty() ? "" : " ") + interface;
        }
    }
    if (interfacesOf.empty()) {
        return skipped("there is no PTP hardware clock");
    }
    if (interfacesOf.size() == 1) {
        return good(fmt::format("ptp{}", interfacesOf.begin()->first));
    }
    std::string found = "the interfaces have different clocks";
    const char* separator = ": ";
    for (const auto& [clock, interfaces] : interfacesOf) {
        found += fmt::format("{}ptp{} of {}", separator, clock, interfaces);
        separator = ", ";
    }
    return bad(found, "use interfaces of one network card");
}

} // namespace vantelhost
