#include "Daemon.h"

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <sys/prctl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace {

pid_t start(const std::vector<std::string>& command, const std::string& outputPath) {
    std::vector<char*> argv;
    for (const std::string& word : command) {
        argv.push_back(const_cast<char*>(word.c_str()));
    }
    argv.push_back(nullptr);
    char* environment[] = {nullptr};
    const pid_t parent = getpid();
    const pid_t pid = fork();
    if (pid != 0) {
        return pid;
    }
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    const int output = open(outputPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
    if (getppid() == parent && dup2(output, 1) == 1 && dup2(output, 2) == 2) {
        execve(argv[0], argv.data(), environment);
    }
    _exit(127);
}

/// Writes configuration and script.
/// @return the command that runs the simulator with them
std::vector<std::string> prepare(const Folder& folder, const std::string& script,
                                 const std::vector<std::string>& interfaces,
                                 const std::string& config) {
    folder.write("config", "[global]\nuds_address " + folder.path("ptp4l") + "\n" + config);
    folder.write("config.sim", "log log\n" + script);
    std::vector<std::string> command{SIMPTP4L_PATH, "-f", folder.path("config")};
    for (const std::string& name : interfaces) {
        command.emplace_back("-i");
        command.push_back(name);
    }
    return command;
}

} // namespace

bool eventually(const std::function<bool()>& condition) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (!condition()) {
        if (std::chrono::steady_clock::now() > deadline) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
    }
    return true;
}

std::string readFile(const std::string& path) {
    std::ifstream file(path);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

Child::Child(const std::vector<std::string>& command, const std::string& outputPath)
    : outputPath_(outputPath), pid_(start(command, outputPath)) {
    if (pid_ < 0) {
        throw std::runtime_error("fork");
    }
}

Child::~Child() {
    if (isRunning()) {
        kill(pid_, SIGKILL);
        waitpid(pid_, nullptr, 0);
    }
}

void Child::signal(int number) const {
    if (!reaped_) {
        kill(pid_, number);
    }
}

bool Child::isRunning() {
    if (!reaped_) {
        reaped_ = waitpid(pid_, &status_, WNOHANG) == pid_;
    }
    return !reaped_;
}

Finished Child::finish() {
    if (!eventually([this] { return !isRunning(); })) {
        kill(pid_, SIGKILL);
        waitpid(pid_, &status_, 0);
        reaped_ = true;
    }
    const int status = WIFEXITED(status_) ? WEXITSTATUS(status_) : -WTERMSIG(status_);
    return {status, readFile(outputPath_)};
}

Folder::Folder() {
    std::string name = std::filesystem::temp_directory_path() / "simptp4l.XXXXXX";
    if (mkdtemp(name.data()) == nullptr) {
        throw std::runtime_error("mkdtemp");
    }
    path_ = name;
}

Folder::~Folder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

void Folder::write(const std::string& name, const std::string& text) const {
    std::ofstream(path(name)) << text;
}

Daemon::Daemon(const std::string& script, const std::vector<std::string>& interfaces,
               const std::string& config)
    : process(prepare(folder, script, interfaces, config), folder.path("output")) {}

bool Daemon::isBound() const {
    return log().find("\"bound\"") != std::string::npos;
}

bool Daemon::waitUntilBound() const {
    return eventually([this] { return isBound(); });
}
