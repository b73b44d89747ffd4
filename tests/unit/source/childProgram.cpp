// A program that tests run as a child. Like the daemon it gets its configuration by "-f FILE"; the
// file says what to do, one word and its value per line, in this order:
//
//     ignore 15           ignores a signal
//     report FILE         writes what it was given into the file, at once as a whole
//     exit 3              ends with this status
//
// At the end of the file it waits for a signal, and for a minute at most.

#include <cinttypes>
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>

#include <unistd.h>

namespace {

const char* configFileOf(char** arguments) {
    for (char** argument = arguments; *argument != nullptr; ++argument) {
        if (std::strcmp(*argument, "-f") == 0 && argument[1] != nullptr) {
            return argument[1];
        }
    }
    return "";
}

bool isBlocked(int signal) {
    sigset_t blocked;
    return sigprocmask(SIG_BLOCK, nullptr, &blocked) == 0 && sigismember(&blocked, signal) == 1;
}

bool isIgnored(int signal) {
    struct sigaction action {};
    return sigaction(signal, nullptr, &action) == 0 && action.sa_handler == SIG_IGN;
}

/// As in /proc/self/status, which in an emulator is the emulator's.
std::string maskOf(bool (*test)(int)) {
    std::uint64_t mask = 0;
    for (int signal = 1; signal <= 64; ++signal) {
        mask |= std::uint64_t{test(signal)} << (signal - 1);
    }
    char digits[17];
    std::snprintf(digits, sizeof(digits), "%016" PRIx64, mask);
    return digits;
}

void reportSignals(std::ostream& report) {
    report << "SigBlk=" << maskOf(&isBlocked) << "\nSigIgn=" << maskOf(&isIgnored) << '\n';
}

void reportDescriptors(std::ostream& report) {
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
        std::error_code ignored;
        report << "descriptor=" << std::filesystem::read_symlink(entry, ignored).string() << '\n';
    }
}

void reportTo(const std::string& file, char** arguments) {
    const std::string unfinished = file + ".unfinished";
    {
        std::ofstream report(unfinished);
        report << "pid=" << getpid() << '\n';
        for (char** argument = arguments; *argument != nullptr; ++argument) {
            report << "argument=" << *argument << '\n';
        }
        for (char** variable = environ; *variable != nullptr; ++variable) {
            report << "variable=" << *variable << '\n';
        }
        reportSignals(report);
        reportDescriptors(report);
    }
    std::rename(unfinished.c_str(), file.c_str());
}

} // namespace

int main(int /*argumentCount*/, char** arguments) {
    alarm(60);
    std::ifstream config(configFileOf(arguments));
    std::string word;
    std::string value;
    while (config >> word >> value) {
        if (word == "ignore") {
            std::signal(std::stoi(value), SIG_IGN);
        } else if (word == "report") {
            reportTo(value, arguments);
        } else if (word == "exit") {
            _exit(std::stoi(value));
        }
    }
    for (;;) {
        pause();
    }
}
