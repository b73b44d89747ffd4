#include "system/ManagementClient.h"

#include <sstream>

#include "support/CommandOutput.h"

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
