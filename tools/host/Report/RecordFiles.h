/// @file
#pragma once

#include <fstream>
#include <string>
#include <vector>

namespace vantelhost {

/// Paths of the files of records in the order in which they were written: FILE.2 before FILE.1
/// before FILE, and what has other names by the first lines' times, if all have one. Of a folder
/// those files are taken that begin with an event, or are of the same FILE as such a one. Throws
/// UsageError for what cannot be read, a folder without a record, and a record that is there twice.
std::vector<std::string> findRecords(const std::vector<std::string>& paths);

/// Throws UsageError.
std::ifstream openRecord(const std::string& path);

} // namespace vantelhost
