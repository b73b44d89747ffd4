/// @file
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <system_error>

namespace vantelhost {

struct Process {
    std::string name;        ///< of what it runs, at most 15 characters
    std::int64_t parent = 0; ///< its id
};

/// The processes that a /proc shows, by their ids.
/// @param error why it shows none
std::map<std::int64_t, Process> processesIn(const std::string& proc, std::error_code& error);

} // namespace vantelhost
