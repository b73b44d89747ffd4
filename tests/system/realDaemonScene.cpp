#include "system/realDaemonScene.h"

#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <thread>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

std::string environment(const char* name) {
    const char* const value = std::getenv(name);
    return value == nullptr ? "" : value;
}

std::string outputOf(const std::string& command) {
    struct Closer {
        void operator()(std::FILE* pipe) const { pclose(pipe); }
    };
    const std::unique_ptr<std::FILE, Closer> pipe(popen(command.c_str(), "re"));
    std::string output;
    char piece[4096];
    for (std::size_t size = 1; pipe && size > 0;) {
        size = std::fread(piece, 1, sizeof(piece), pipe.get());
        output.append(piece, size);
    }
    return output;
}

} // namespace

bool RealDaemonScene::isProvided() {
    return !environment("TESTBED_INTERFACES").empty();
}

RealDaemonScene::RealDaemonScene() : folder_(environment("TESTBED_FOLDER")) {
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
    std::istringstream interfaces(environment("TESTBED_INTERFACES"));
    for (std::string interface; interfaces >> interface; ++ports_) {
        configuration << '[' << interface << "]\n";
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

RealDaemonScene::~RealDaemonScene() {
    kill(daemon_, SIGTERM);
    waitpid(daemon_, nullptr, 0);
}

void RealDaemonScene::start() {
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

void RealDaemonScene::waitUntilFollowing() {
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

std::string RealDaemonScene::log() const {
    std::ifstream file(path("boundary.log"));
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

std::vector<RealDaemonScene::Report> RealDaemonScene::ask(const std::string& dataSet) const {
    std::istringstream lines(
        outputOf("/usr/sbin/pmc -u -b 0 -s " + socket() + " 'GET " + dataSet + "' 2>&1"));
    std::vector<Report> reports;
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::string name;
        std::string value;
        words >> name >> value;
        if (line.find(" RESPONSE MANAGEMENT " + dataSet) != std::string::npos) {
            reports.emplace_back();
        } else if (!reports.empty()) {
            reports.back()[name] = value;
        }
    }
    return reports;
}

PausedGrandmaster::PausedGrandmaster()
    : pid_(static_cast<pid_t>(std::stol(environment("TESTBED_GRANDMASTER_PID")))) {
    kill(pid_, SIGSTOP);
}

PausedGrandmaster::~PausedGrandmaster() {
    kill(pid_, SIGCONT);
}
