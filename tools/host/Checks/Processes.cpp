#include "Checks/Processes.h"

#include <filesystem>
#include <fstream>

namespace vantelhost {

namespace {

std::string commandOf(const std::filesystem::path& process) {
    std::string name;
    std::getline(std::ifstream(process / "comm") >> std::ws, name);
    return name;
}

} // namespace

std::vector<Process> processesIn(const std::string& proc, std::error_code& error) {
    std::vector<Process> processes;
    for (std::filesystem::directory_iterator each(proc, error), end; !error && each != end;
         each.increment(error)) {
        const std::string id = each->path().filename();
        if (id.find_first_not_of("0123456789") == std::string::npos) {
            processes.push_back({id, commandOf(each->path())});
        }
    }
    return processes;
}

} // namespace vantelhost
