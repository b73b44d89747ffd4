/// @file
#pragma once

#include <string>

namespace vantelhost {

/// A file to write to; closed with this object. A regular file is nobody else's RecordFile at the
/// same time.
class RecordFile {
public:
    /// Leaves what is in the file. Throws UsageError.
    explicit RecordFile(const std::string& path);
    ~RecordFile();
    RecordFile(const RecordFile&) = delete;
    RecordFile& operator=(const RecordFile&) = delete;

    /// Empties the file. Throws UsageError.
    void begin() const;

    int descriptor() const { return descriptor_; }

private:
    const std::string path_;
    int descriptor_;
};

} // namespace vantelhost
