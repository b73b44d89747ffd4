/// @file
#pragma once

#include <map>
#include <string>
#include <vector>

/// One answer as linuxptp's client prints it: texts by the names of their fields.
using Report = std::map<std::string, std::string>;

/// Asks a daemon with linuxptp's own client, pmc. @return one report per answer.
std::vector<Report> askDaemon(const std::string& socket, const std::string& dataSet);
