/// @file
#pragma once

#include <cstdint>
#include <string>

namespace vantelhost {

/// A file to write to, behind what is in it; closed with this object. A regular file is nobody
/// else's RecordFile at the same time.
class RecordFile {
public:
    /// Leaves what is in the file. Throws UsageError.
    explicit RecordFile(const std::string& path);
    ~RecordFile();
    RecordFile(RecordFile&& other) noexcept;
    RecordFile& operator=(RecordFile&& other) noexcept;

    /// Empties the file. Throws UsageError.
    void begin() const;

    int descriptor() const { return descriptor_; }

    bool isRegular() const;

    /// Octets; 0 if it is not regular.
    std::uint64_t size() const;

    /// Whether the file, or another one that now has its path, is this one.
    bool isAt(const std::string& path) const;

private:
    std::string path_;
    int descriptor_;
};

} // namespace vantelhost
