#include "PmcClients.h"

#include <array>
#include <stdexcept>

const char pmcProgram[] = "/usr/sbin/pmc";

namespace {

struct Command {
    const char* text;
    bool isPerPort;
};

constexpr std::array<Command, 6> commands{{{"GET TIME_STATUS_NP", false},
                                           {"GET PARENT_DATA_SET", false},
                                           {"GET DEFAULT_DATA_SET", false},
                                           {"GET PORT_DATA_SET", true},
                                           {"GET PORT_DATA_SET_NP", true},
                                           {"GET PORT_PROPERTIES_NP", true}}};

std::vector<std::string> commandLine(const std::string& daemon) {
    return {pmcProgram, "-u", "-b", "0", "-s", daemon};
}

int count(const std::string& text, const std::string& part) {
    int found = 0;
    for (auto at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) {
        ++found;
    }
    return found;
}

/// Reads until that many answers are printed, or until the end.
void readAnswers(const Child& child, int expected) {
    std::string output;
    while (count(output, " RESPONSE MANAGEMENT ") < expected) {
        const std::string piece = child.read();
        if (piece.empty()) {
            throw std::runtime_error("an answer is missing in what pmc prints");
        }
        output += piece;
    }
}

} // namespace

OpenPmc::OpenPmc(const std::string& daemon, std::uint16_t ports)
    : Client("pmc kept open"), child_(commandLine(daemon)), ports_(ports) {}

void OpenPmc::poll() {
    for (const Command& command : commands) {
        child_.write(std::string(command.text) + '\n');
        readAnswers(child_, command.isPerPort ? ports_ : 1);
    }
}

PmcPerPoll::PmcPerPoll(const std::string& daemon, std::uint16_t ports)
    : Client("pmc per poll"), daemon_(daemon), ports_(ports) {}

void PmcPerPoll::poll() {
    auto arguments = commandLine(daemon_);
    for (const Command& command : commands) {
        arguments.emplace_back(command.text);
    }
    Child child(arguments);
    readAnswers(child, 3 + 3 * ports_);
    cpuSeconds_ += child.waitForEnd();
}
