/// @file
#pragma once

#include <istream>
#include <memory>
#include <string>
#include <vector>

namespace vantelhost {

/// A file of a record, opened.
struct RecordSource {
    std::string path;
    std::unique_ptr<std::istream> stream;
};

/// Opens files of records in the order in which they were written: FILE.2 before FILE.1 before
/// FILE, and what has other names by the first lines' times, if all have one. Of a folder those
/// files are taken that begin with an event, or are of the same FILE as such a one. Throws
/// UsageError for what cannot be read, a folder without a record, and a record that is there twice.
std::vector<RecordSource> openRecords(const std::vector<std::string>& paths);

} // namespace vantelhost
