/// @file
/// A local clock that another program steers, through a file that both map.
#pragma once

#include <cstdint>
#include <string>

namespace simptp4l {

/// What the file holds: five values of eight octets in the machine's byte order. Whoever steers
/// changes them between two requests only.
struct SteeredTime {
    std::int64_t now;         ///< ns since 1970; must not go back
    std::int64_t grandmaster; ///< what the grandmaster's clock shows more than that, ns
    std::int64_t since;       ///< when the local clock was steered last, ns since 1970
    std::int64_t local;       ///< what it showed then, ns
    double frequency;         ///< by how much it has run faster than time since then, ppb

    /// What the local clock shows at a time.
    std::int64_t localAt(std::int64_t time) const;
};

/// The mapped file. Throws std::system_error when it cannot be mapped.
class SteeredTimeFile {
public:
    explicit SteeredTimeFile(const std::string& path);
    ~SteeredTimeFile();
    SteeredTimeFile(const SteeredTimeFile&) = delete;
    SteeredTimeFile& operator=(const SteeredTimeFile&) = delete;

    const SteeredTime& operator*() const { return *time_; }
    const SteeredTime* operator->() const { return time_; }

private:
    const SteeredTime* time_;
};

} // namespace simptp4l
