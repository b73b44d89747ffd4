// A program that tests run as a child. Like the daemon it gets its configuration by "-f FILE"; the
// file says what to do, one word and its value per line, in this order:
//
//     ignore 15           ignores a signal
//     report FILE         writes what it was given into the file, at once as a whole
//     exit 3              ends with this status
//
// At the end of the file it waits for a signal, and for a minute at most.

#include <csignal>
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

void reportSignals(std::ostream& report) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("SigBlk:", 0) == 0 || line.rfind("SigIgn:", 0) == 0) {
            line.replace(6, 2, "=");
            report << line << '\n';
        }
    }
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
