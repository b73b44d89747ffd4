#include "system/BoundaryClock.h"

#include <algorithm>
#include <chrono>
#include <csignal>
#include <fstream>
#include <stdexcept>

#include "support/Processes.h"
#include "support/TemporaryFolder.h"
#include "system/Scene.h"

bool BoundaryClock::isProvided() {
    return !sceneInterfaces().empty();
}

BoundaryClock::BoundaryClock() : folder_(sceneVariable("TESTBED_FOLDER")), daemon_(command()) {
    if (!waitUntil([this] { return isFollowing(); }, std::chrono::seconds(30))) {
        throw std::runtime_error("the daemon does not follow the grandmaster:\n" +
                                 readFile(path("boundary.log")));
    }
}

BoundaryClock::~BoundaryClock() {
    daemon_.signal(SIGTERM);
    daemon_.wait();
}

std::size_t BoundaryClock::ports() const {
    return sceneInterfaces().size();
}

std::vector<std::string> BoundaryClock::command() const {
    std::ofstream configuration(path("boundary.conf"));
    configuration << "[global]\n"
                     "network_transport UDPv4\n"
                     "ptp_dst_mac 01:1B:19:00:00:00\n"
                     "time_stamping software\n"
                     "free_running 1\n"
                     "logAnnounceInterval 0\n"
                     "logSyncInterval -3\n"
                     "priority1 200\n"
                     "uds_address "
                  << socket() << '\n';
    for (const std::string& interface : sceneInterfaces()) {
        configuration << '[' << interface << "]\n";
    }
    return {"/bin/sh", "-c", R"(exec /usr/sbin/ptp4l -S -m -q -f "$0" >"$1" 2>&1)",
            path("boundary.conf"), path("boundary.log")};
}

bool BoundaryClock::isFollowing() const {
    const auto reports = ask("TIME_STATUS_NP");
    return std::any_of(reports.begin(), reports.end(), [](const Report& report) {
        return report.at("gmPresent") == "true" && report.at("ingress_time") != "0";
    });
}

std::vector<Report> BoundaryClock::ask(const std::string& dataSet) const {
    return askDaemon(socket(), dataSet);
}

PausedGrandmaster::PausedGrandmaster()
    : pid_(static_cast<pid_t>(std::stol(sceneVariable("TESTBED_GRANDMASTER_PID")))) {
    kill(pid_, SIGSTOP);
}

PausedGrandmaster::~PausedGrandmaster() {
    kill(pid_, SIGCONT);
}
