/// @file
#pragma once

#include <string>

namespace vantelhost {

/// A new, empty file to write a record to; closed with this object.
class RecordFile {
public:
    /// Throws UsageError.
    explicit RecordFile(const std::string& path);
    ~RecordFile();
    RecordFile(const RecordFile&) = delete;
    RecordFile& operator=(const RecordFile&) = delete;

    int descriptor() const { return descriptor_; }

private:
    int descriptor_;
};

} // namespace vantelhost
