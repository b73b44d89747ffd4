#include "Checks/Processes.h"

#include <filesystem>
#include <fstream>

#include "Numbers.h"

namespace vantelhost {

namespace {

/// What the kernel's status file says of a process; empty when it has ended meanwhile.
Process read(const std::filesystem::path& folder) {
    Process process;
    std::ifstream status(folder / "status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("Name:\t", 0) == 0) {
            process.name = line.substr(6);
        } else if (line.rfind("PPid:\t", 0) == 0) {
            process.parent = parseInteger(line.substr(6)).value_or(0);
        }
    }
    return process;
}

} // namespace

std::map<std::int64_t, Process> processesIn(const std::string& proc, std::error_code& error) {
    std::map<std::int64_t, Process> processes;
    for (std::filesystem::directory_iterator each(proc, error), end; !error && each != end;
         each.increment(error)) {
        const std::string id = each->path().filename();
        if (id.find_first_not_of("0123456789") == std::string::npos) {
            processes[parseInteger(id).value_or(0)] = read(each->path());
        }
    }
    return processes;
}

} // namespace vantelhost
