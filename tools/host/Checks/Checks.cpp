#include "Checks/Checks.h"

#include "Checks/DaemonChecks.h"
#include "Checks/FifoCheck.h"
#include "Checks/InterfaceChecks.h"
#include "Checks/MachineChecks.h"
#include "Checks/PathChecks.h"
#include "Checks/SettingsChecks.h"

namespace vantelhost {

namespace {

struct Check {
    const char* name;
    Finding (*check)(const Subject& subject);
};

/// The name of the interface goes behind the name of the check.
struct InterfaceCheck {
    const char* name;
    Finding (*check)(const Subject& subject, const std::string& interface);
};

constexpr Check firstChecks[] = {
    {"daemon", checkDaemon},
    {"configuration", checkConfiguration},
    {"followUpInfo", checkFollowUpInfo},
    {"delayMechanism", checkDelayMechanism},
    {"other daemons", checkOtherDaemons},
    {"interfaces", checkInterfaces},
};

constexpr InterfaceCheck interfaceChecks[] = {
    {"interface", checkInterface},
    {"time stamping", checkTimeStamping},
    {"clock device", checkClockDevice},
};

constexpr Check otherChecks[] = {
    {"one clock", checkOneClock},
    {"configFile", checkConfigFile},
    {"udsAddress", checkUdsAddress},
    {"udsAddress folder", checkUdsFolder},
    {"udsAddress in use", checkUdsInUse},
    {"plug-in's socket", checkOwnSocket},
    {"epoch FIFO", checkFifo},
    {"capabilities", checkCapabilities},
    {"datagram queue", checkDatagramQueue},
};

} // namespace

CheckResults checkMachine(const Subject& subject) {
    CheckResults results;
    for (const auto& [name, check] : firstChecks) {
        results.push_back({name, check(subject)});
    }
    for (const auto& interface : subject.interfaces) {
        for (const auto& [name, check] : interfaceChecks) {
            results.push_back({name + (" " + interface), check(subject, interface)});
        }
    }
    for (const auto& [name, check] : otherChecks) {
        results.push_back({name, check(subject)});
    }
    return results;
}

} // namespace vantelhost
