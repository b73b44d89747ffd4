/// @file
#pragma once

#include <fstream>
#include <string>
#include <vector>

#include <csignal>
#include <gtest/gtest.h>
#include <sys/wait.h>

#include "support/Processes.h"

/// What the program of childProgram.cpp wrote about itself: lines "name=value".
class ChildReport {
public:
    /// Waits for the file.
    explicit ChildReport(const std::string& file) {
        EXPECT_TRUE(waitUntil([&] { return std::ifstream(file).good(); })) << file;
        std::ifstream report(file);
        for (std::string line; std::getline(report, line);) {
            lines_.push_back(line);
        }
    }

    std::vector<std::string> all(const std::string& name) const {
        std::vector<std::string> values;
        for (const std::string& line : lines_) {
            if (line.compare(0, name.size() + 1, name + "=") == 0) {
                values.push_back(line.substr(name.size() + 1));
            }
        }
        return values;
    }

    pid_t pid() const { return std::stoi(all("pid").at(0)); }

    /// Whether a signal is in one of the child's sets.
    bool has(const std::string& set, int signal) const {
        return (std::stoull(all(set).at(0), nullptr, 16) >> (signal - 1) & 1U) != 0;
    }

private:
    std::vector<std::string> lines_;
};

/// Ends a child, unless it has been reaped.
inline void endChild(pid_t pid) {
    if (pid > 0 && waitpid(pid, nullptr, WNOHANG) == 0) {
        kill(pid, SIGKILL);
        waitpid(pid, nullptr, 0);
    }
}

/// Changes the disposition of a signal while it lives.
class Disposition {
public:
    Disposition(int signal, sighandler_t handler)
        : signal_(signal), previous_(std::signal(signal, handler)) {}
    ~Disposition() { std::signal(signal_, previous_); }
    Disposition(const Disposition&) = delete;
    Disposition& operator=(const Disposition&) = delete;

private:
    int signal_;
    sighandler_t previous_;
};

/// Blocks signals in this thread while it lives.
class BlockedSignals {
public:
    explicit BlockedSignals(std::initializer_list<int> signals) {
        sigset_t set;
        sigemptyset(&set);
        for (const int signal : signals) {
            sigaddset(&set, signal);
        }
        pthread_sigmask(SIG_SETMASK, &set, &previous_);
    }
    ~BlockedSignals() { pthread_sigmask(SIG_SETMASK, &previous_, nullptr); }
    BlockedSignals(const BlockedSignals&) = delete;
    BlockedSignals& operator=(const BlockedSignals&) = delete;

private:
    sigset_t previous_{};
};

/// The signals that this thread blocks.
inline std::vector<int> blockedSignals() {
    sigset_t set;
    pthread_sigmask(SIG_SETMASK, nullptr, &set);
    std::vector<int> signals;
    for (int signal = 1; signal < SIGRTMIN; ++signal) {
        if (sigismember(&set, signal) == 1) {
            signals.push_back(signal);
        }
    }
    return signals;
}
