#include "StartRecord.h"

#include <algorithm>
#include <csignal>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <system_error>
#include <unistd.h>

namespace simptp4l {
namespace {

std::vector<std::string> environment() {
    std::vector<std::string> entries;
    for (char** entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
        entries.emplace_back(*entry);
    }
    return entries;
}

/// The descriptor that lists the folder is closed again, and so left out, before the check.
std::vector<int> openDescriptors() {
    std::vector<int> descriptors;
    std::error_code failed;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd", failed)) {
        descriptors.push_back(std::stoi(entry.path().filename()));
    }
    const auto isClosed = [](int descriptor) { return fcntl(descriptor, F_GETFD) < 0; };
    descriptors.erase(std::remove_if(descriptors.begin(), descriptors.end(), isClosed),
                      descriptors.end());
    std::sort(descriptors.begin(), descriptors.end());
    return descriptors;
}

bool isBlocked(int number) {
    sigset_t blocked;
    return pthread_sigmask(SIG_BLOCK, nullptr, &blocked) == 0 && sigismember(&blocked, number) == 1;
}

bool isIgnored(int number) {
    struct sigaction action {};
    return sigaction(number, nullptr, &action) == 0 && action.sa_handler == SIG_IGN;
}

std::vector<std::string> signalsThat(bool (*test)(int)) {
    std::vector<std::string> names;
    for (int number = 1; number <= SIGRTMAX; ++number) {
        if (test(number)) {
            names.push_back(signalName(number));
        }
    }
    return names;
}

} // namespace

StartRecord recordStart(int argc, char** argv) {
    StartRecord record;
    record.argv.assign(argv, argv + argc);
    record.environment = environment();
    record.openDescriptors = openDescriptors();
    record.blockedSignals = signalsThat(isBlocked);
    record.ignoredSignals = signalsThat(isIgnored);
    record.pid = getpid();
    return record;
}

std::string signalName(int number) {
    const char* name = sigabbrev_np(number);
    return name != nullptr ? std::string("SIG") + name : std::to_string(number);
}

} // namespace simptp4l
