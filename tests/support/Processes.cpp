#include "support/Processes.h"

#include <algorithm>
#include <atomic>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

#include <sys/wait.h>
#include <unistd.h>

namespace {

/// From /proc/PID/stat: what stands behind the name and the state. @return 0 when it is gone.
pid_t parentOf(const std::filesystem::path& process) {
    std::ifstream file(process / "stat");
    std::string line;
    std::getline(file, line);
    const std::size_t name = line.rfind(')');
    return name == std::string::npos ? 0 : std::stoi(line.substr(name + 4));
}

bool isProcess(const std::filesystem::path& path) {
    const std::string name = path.filename();
    return std::all_of(name.begin(), name.end(), [](char c) { return c >= '0' && c <= '9'; });
}

} // namespace

bool waitUntil(const std::function<bool()>& condition, std::chrono::milliseconds deadline) {
    const auto end = std::chrono::steady_clock::now() + deadline;
    while (!condition()) {
        if (std::chrono::steady_clock::now() > end) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
}

bool hasChildren() {
    siginfo_t ignored{};
    return waitid(P_ALL, 0, &ignored, WEXITED | WNOHANG | WNOWAIT) == 0;
}

bool hasDeadChild() {
    siginfo_t dead{};
    return waitid(P_ALL, 0, &dead, WEXITED | WNOHANG | WNOWAIT) == 0 && dead.si_pid != 0;
}

std::vector<pid_t> children() {
    std::vector<pid_t> found;
    for (const auto& entry : std::filesystem::directory_iterator("/proc")) {
        if (isProcess(entry.path()) && parentOf(entry.path()) == getpid()) {
            found.push_back(std::stoi(entry.path().filename()));
        }
    }
    return found;
}

void endChildren() {
    while (hasChildren()) {
        for (const pid_t child : children()) {
            kill(child, SIGKILL);
            waitpid(child, nullptr, 0);
        }
    }
}

int threadCount() {
    const std::filesystem::directory_iterator threads("/proc/self/task");
    return static_cast<int>(std::distance(begin(threads), end(threads)));
}

int settledThreadCount() {
    const int before = threadCount();
    std::atomic<int> within{0};
    std::thread([&] { within = threadCount(); }).join();
    waitUntil([&] { return threadCount() < within; });
    return std::max(before, within - 1);
}

FormerThreads::FormerThreads() : count_(settledThreadCount()) {}

FormerThreads::~FormerThreads() {
    waitUntil([this] { return threadCount() <= count_; }, std::chrono::seconds(1));
}
