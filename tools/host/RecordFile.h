/// @file
#pragma once

#include <string>

namespace vantelhost {

/// A new, empty file to write to; closed with this object. A regular file is nobody else's
/// RecordFile at the same time.
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
