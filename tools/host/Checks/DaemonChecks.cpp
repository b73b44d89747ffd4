#include "Checks/DaemonChecks.h"

#include <cerrno>
#include <fstream>
#include <iterator>

#include <fmt/format.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Checks/Access.h"
#include "Checks/DaemonMessages.h"
#include "Checks/Processes.h"
#include "Checks/TimedProgram.h"
#include "Text.h"

namespace vantelhost {

namespace {

bool isExecutable(const std::string& path) {
    struct stat state {};
    return ::stat(path.c_str(), &state) == 0 && S_ISREG(state.st_mode) && isAllowed(path, X_OK);
}

/// The only section of the plug-in's file. Another one could be that of an interface, with which
/// ptp4l would start a clock.
bool hasOtherSections(const std::string& text) {
    const std::string section = "[global]";
    const auto begin = text.find(section);
    return text.find('[') != begin ||
           (begin != std::string::npos && text.find('[', begin + 1) != std::string::npos);
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

std::string firstLine(const std::string& text) {
    const auto begin = text.find_first_not_of(" \n");
    return begin == std::string::npos ? "" : text.substr(begin, text.find('\n', begin) - begin);
}

std::string shownEnd(const ProgramEnd& end) {
    const std::string line = firstLine(end.output);
    if (!line.empty()) {
        return "it says: " + line;
    }
    return WIFSIGNALED(end.status)
               ? fmt::format("it was ended by signal {}, without a word", WTERMSIG(end.status))
               : fmt::format("it ended with status {}, without a word", WEXITSTATUS(end.status));
}

/// How to get a missing ptp4l to its path.
std::string mendOfMissing(const Subject& subject) {
    if (subject.daemon == subject.usualDaemon) {
        return "install linuxptp";
    }
    const std::string link = fmt::format("ln -sf {} {}", subject.usualDaemon, subject.daemon);
    return isExecutable(subject.usualDaemon) ? link : "install linuxptp, then " + link;
}

} // namespace

Finding checkDaemon(const Subject& subject) {
    const std::string& path = subject.daemon;
    if (isExecutable(path)) {
        return good(path);
    }
    struct stat state {};
    if (::stat(path.c_str(), &state) != 0) {
        const std::string problem = fmt::format("{}: {}", path, errorText(errno));
        return bad(problem, mendOfMissing(subject));
    }
    return S_ISREG(state.st_mode)
               ? bad(path + ": is not executable", fmt::format("chmod +x {}", path))
               : bad(path + ": is not a program", "put ptp4l, or a link to it, there");
}

bool isScript(const std::string& program) {
    char first[2] = {};
    return isExecutable(program) && std::ifstream(program, std::ios::binary).read(first, 2) &&
           first[0] == '#' && first[1] == '!';
}

std::string mendFor(const std::string& option) {
    static constexpr struct {
        const char* option; ///< of ptp4l
        const char* key;    ///< the plug-in's parameter
    } rows[] = {
        {"priority1", "priority1"},
        {"priority2", "priority2"},
        {"offsetScaledLogVariance", "offsetScaledLogVariance"},
        {"logAnnounceInterval", "logAnnounceInterval"},
        {"logSyncInterval", "logSyncInterval"},
        {"syncReceiptTimeout", "syncReceiptTimeout"},
        {"neighborPropDelayThresh", "neighborPropDelayThreshold"},
        {"assume_two_step", "assumeTwoStep"},
        {"path_trace_enabled", "pathTraceEnabled"},
        {"follow_up_info", "followUpInfo"},
        {"transportSpecific", "transportSpecific"},
        {"uds_address", "udsAddress"},
        {"ptp_dst_mac", "ptpDstMac"},
        {"delay_mechanism", "delayMechanism"},
    };
    if (option == "network_transport") {
        return "--set networkTransport=UDPv4 --set ptpDstMac=01:1B:19:00:00:00; UDPv4RAW needs "
               "another ptp4l than that of linuxptp";
    }
    for (const auto& row : rows) {
        if (option == row.option) {
            return fmt::format("another value: --set {}=...", row.key);
        }
    }
    return {};
}

Finding checkConfiguration(const Subject& subject) {
    return checkConfigurationWithin(subject, std::chrono::seconds(10));
}

Finding checkConfigurationWithin(const Subject& subject, std::chrono::milliseconds longest) {
    if (!subject.rendered) {
        return skipped("the plug-in wrote no file");
    }
    if (!isExecutable(subject.daemon)) {
        return skipped("there is no daemon");
    }
    const std::string file = contentOf(*subject.rendered);
    if (hasOtherSections(file)) {
        return skipped("a setting adds a section, with which ptp4l could start a clock");
    }
    const auto end = runTimed({subject.daemon, "-f", *subject.rendered, "-m", "-q"}, longest);
    if (end.error != 0) {
        return bad(fmt::format("{}: {}", subject.daemon, errorText(end.error)),
                   "put ptp4l, or a link to it, there");
    }
    if (end.timedOut) {
        return bad(fmt::format("{} did not end without an interface", subject.daemon),
                   "put ptp4l, or a link to it, there");
    }
    const Answer answer = understand(end.output, file);
    return answer.isTaken ? good("ptp4l takes it") : bad(shownEnd(end), mendFor(answer.option));
}

Finding checkOtherDaemons(const Subject& subject) {
    std::string daemons;
    std::error_code error;
    for (const auto& [id, process] : processesIn(subject.proc, error)) {
        if (process.name == "ptp4l") {
            daemons += " " + std::to_string(id);
        }
    }
    if (error) {
        return skipped(fmt::format("{}: {}", subject.proc, error.message()));
    }
    if (!daemons.empty()) {
        return doubtful("ptp4l runs already: process" + daemons,
                        "end it, unless it uses other interfaces and sockets");
    }
    return good("none");
}

} // namespace vantelhost
