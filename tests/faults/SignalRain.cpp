#include "SignalRain.h"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <string>
#include <utility>

#include <poll.h>
#include <sys/syscall.h>
#include <unistd.h>

#include "support/Processes.h"

namespace {

std::atomic<int> handled{0};

void handler(int /*signal*/) {
    ++handled;
}

void setHandler() {
    struct sigaction action {};
    action.sa_handler = handler;
    sigaction(SIGUSR1, &action, nullptr);
}

/// @return whether there is such a thread.
bool sendTo(pid_t thread) {
    return syscall(SYS_tgkill, getpid(), thread, SIGUSR1) == 0;
}

/// From /proc/self/task/TID/stat: the letter behind the name.
char stateOf(pid_t thread) {
    std::ifstream file("/proc/self/task/" + std::to_string(thread) + "/stat");
    std::string line;
    std::getline(file, line);
    const std::size_t name = line.rfind(')');
    return name == std::string::npos ? '?' : line.at(name + 2);
}

} // namespace

std::set<pid_t> threadIds() {
    std::set<pid_t> ids;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/task")) {
        ids.insert(std::stoi(entry.path().filename()));
    }
    return ids;
}

bool interrupt(pid_t thread) {
    setHandler();
    const int before = handled;
    if (!waitUntil([=] { return stateOf(thread) == 'S'; })) {
        return false;
    }
    sendTo(thread);
    return waitUntil([=] { return handled > before; });
}

SignalRain::SignalRain(std::vector<pid_t> threads, std::function<bool()> condition) {
    setHandler();
    thread_ = std::thread([this, threads = std::move(threads), condition = std::move(condition)] {
        while (!done_) {
            int awaited = handled;
            for (std::size_t i = 0; i < threads.size() && condition(); ++i) {
                awaited += sendTo(threads[i]) ? 1 : 0;
            }
            // A thread that does nothing but handle signals gets nowhere, in an emulator, too. One
            // that ended will not handle its own.
            for (int i = 0; i == 0 || (i < 100 && handled < awaited); ++i) {
                poll(nullptr, 0, 1); // Its nanosleep would count as the plug-in's.
            }
        }
    });
}

SignalRain::~SignalRain() {
    done_ = true;
    thread_.join();
}

int handledSignals() {
    return handled;
}
