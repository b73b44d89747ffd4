#include "Checks/SettingsChecks.h"

#include <algorithm>
#include <cstdlib>

#include <fmt/format.h>
#include <strings.h>

namespace vantelhost {

namespace {

/// As it stands in the plug-in's requests.
long nibbleOf(const std::string& transportSpecific) {
    return std::strtol(transportSpecific.c_str(), nullptr, 16) & 0xF;
}

} // namespace

Finding checkInterfaces(const Subject& subject) {
    const auto& names = subject.interfaces;
    for (auto each = names.begin(); each != names.end(); ++each) {
        if (std::find(names.begin(), each, *each) != each) {
            return bad(fmt::format("{} is named twice: ptp4l makes one port of both", *each),
                       "name each interface once");
        }
    }
    return good(fmt::format("{}, each named once", names.size()));
}

Finding checkFollowUpInfo(const Subject& subject) {
    const auto transportSpecific = setting(subject, "transportSpecific");
    if (!transportSpecific || !subject.settings->contains("followUpInfo")) {
        return skipped("there are no such settings");
    }
    if (subject.settings->at("followUpInfo") != true) {
        return good("false");
    }
    const long nibble = nibbleOf(*transportSpecific);
    const std::string found = fmt::format("true, with transportSpecific {}", *transportSpecific);
    if (nibble == 1 || nibble == 2) {
        return good(found);
    }
    return doubtful(found + ": ptp4l of linuxptp 4.4 and later drops the plug-in's requests",
                    "--set transportSpecific=0x1, as IEEE 802.1AS has it, or --set "
                    "followUpInfo=false");
}

Finding checkDelayMechanism(const Subject& subject) {
    const auto mechanism = setting(subject, "delayMechanism");
    if (!mechanism) {
        return skipped("there is no such setting");
    }
    if (::strcasecmp(mechanism->c_str(), "NONE") == 0) {
        return doubtful(*mechanism + ": no delay is measured, it would be part of every offset",
                        "--set delayMechanism=E2E or P2P, as the network has it");
    }
    return good(*mechanism + "; whether the network has it is not to be seen");
}

} // namespace vantelhost
