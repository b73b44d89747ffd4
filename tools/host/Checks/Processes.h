/// @file
#pragma once

#include <string>
#include <system_error>
#include <vector>

namespace vantelhost {

struct Process {
    std::string id;
    std::string name; ///< of what it runs, at most 15 characters
};

/// The processes that a /proc shows.
/// @param error why it shows none
std::vector<Process> processesIn(const std::string& proc, std::error_code& error);

} // namespace vantelhost
