#include "PmcClients.h"

#include <array>
#include <stdexcept>

#include <unistd.h>

namespace {

constexpr char pmcProgram[] = "/usr/sbin/pmc";

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

/// @param own pmc's own socket: where it makes one by default, only root may.
std::vector<std::string> commandLine(const std::string& daemon, const std::string& own) {
    if (access(pmcProgram, X_OK) != 0) {
        throw std::runtime_error("there is no " + std::string(pmcProgram) + " (package linuxptp)");
    }
    return {pmcProgram, "-u", "-b", "0", "-i", own, "-s", daemon};
}

/// Reads until that many answers more are printed.
void readAnswers(Child& child, int expected) {
    if (!child.waitForOutput(" RESPONSE MANAGEMENT ", expected)) {
        throw std::runtime_error("an answer is missing in what pmc prints: " + child.errors());
    }
    child.forgetOutput();
}

} // namespace

OpenPmc::OpenPmc(const std::string& daemon, std::uint16_t ports)
    : Client("pmc kept open"), child_(commandLine(daemon, "pmc-open.sock")), ports_(ports) {}

void OpenPmc::poll() {
    for (const Command& command : commands) {
        child_.write(std::string(command.text) + '\n');
        readAnswers(child_, command.isPerPort ? ports_ : 1);
    }
}

PmcPerPoll::PmcPerPoll(const std::string& daemon, std::uint16_t ports)
    : Client("pmc per poll"), daemon_(daemon), ports_(ports) {}

void PmcPerPoll::poll() {
    auto arguments = commandLine(daemon_, "pmc-per-poll.sock");
    for (const Command& command : commands) {
        arguments.emplace_back(command.text);
    }
    Child child(arguments);
    readAnswers(child, 3 + 3 * ports_);
    child.wait();
    cpuSeconds_ += child.cpuSeconds();
}
