#include "system/BoundaryClock.h"

#include <chrono>
#include <csignal>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <thread>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "system/Scene.h"

bool BoundaryClock::isProvided() {
    return !sceneInterfaces().empty();
}

BoundaryClock::BoundaryClock() : folder_(sceneVariable("TESTBED_FOLDER")) {
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
        ++ports_;
    }
    configuration.close();
    start();
    try {
        waitUntilFollowing();
    } catch (...) {
        kill(daemon_, SIGKILL);
        waitpid(daemon_, nullptr, 0);
        throw;
    }
}

BoundaryClock::~BoundaryClock() {
    kill(daemon_, SIGTERM);
    waitpid(daemon_, nullptr, 0);
}

void BoundaryClock::start() {
    std::string program = "/usr/sbin/ptp4l";
    std::string file = path("boundary.conf");
    std::string options[] = {program, "-S", "-m", "-q", "-f", file};
    std::vector<char*> arguments;
    for (std::string& option : options) {
        arguments.push_back(option.data());
    }
    arguments.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, path("boundary.log").c_str(),
                                     O_WRONLY | O_CREAT | O_TRUNC, 0644);
    posix_spawn_file_actions_adddup2(&actions, STDOUT_FILENO, STDERR_FILENO);
    const int result =
        posix_spawn(&daemon_, program.c_str(), &actions, nullptr, arguments.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    if (result != 0) {
        throw std::runtime_error("the daemon does not start");
    }
}

void BoundaryClock::waitUntilFollowing() {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(30);
    while (std::chrono::steady_clock::now() < deadline) {
        for (const Report& report : ask("TIME_STATUS_NP")) {
            if (report.at("gmPresent") == "true" && report.at("ingress_time") != "0") {
                return;
            }
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    throw std::runtime_error("the daemon does not follow the grandmaster:\n" + log());
}

std::string BoundaryClock::log() const {
    std::ifstream file(path("boundary.log"));
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
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
