#include "system/ManagementClient.h"

#include <cstdio>
#include <memory>
#include <sstream>

namespace {

std::string outputOf(const std::string& command) {
    struct Closer {
        void operator()(std::FILE* pipe) const { pclose(pipe); }
    };
    const std::unique_ptr<std::FILE, Closer> pipe(popen(command.c_str(), "re"));
    std::string output;
    char piece[4096];
    for (std::size_t size = 1; pipe && size > 0;) {
        size = std::fread(piece, 1, sizeof(piece), pipe.get());
        output.append(piece, size);
    }
    return output;
}

} // namespace

std::vector<Report> askDaemon(const std::string& socket, const std::string& dataSet) {
    std::istringstream lines(
        outputOf("/usr/sbin/pmc -u -b 0 -s " + socket + " 'GET " + dataSet + "' 2>&1"));
    std::vector<Report> reports;
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::string name;
        std::string value;
        words >> name >> value;
        if (line.find(" RESPONSE MANAGEMENT " + dataSet) != std::string::npos) {
            reports.emplace_back();
        } else if (!reports.empty()) {
            reports.back()[name] = value;
        }
    }
    return reports;
}
